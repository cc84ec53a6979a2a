#include "import/SxStream.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

// Reads up to `maxBytes` from the descriptor into `data`; true when the end was reached.
bool ReadUpTo(int fd, std::size_t maxBytes, std::string& data, const std::string& path) {
    constexpr std::size_t kChunk = std::size_t{1} << 20;
    for (;;) {
        // One byte beyond the limit tells a file of exactly the limit from a larger one.
        const std::size_t room = maxBytes + 1 - data.size();
        const std::size_t old = data.size();
        data.resize(old + std::min(kChunk, room));
        const ssize_t got = ::read(fd, data.data() + old, data.size() - old);
        if (got < 0 && errno == EINTR) {
            data.resize(old);
            continue;
        }
        if (got < 0)
            throw CFileException(path, std::strerror(errno));
        data.resize(old + static_cast<std::size_t>(got));
        if (got == 0)
            return true;
        if (data.size() > maxBytes)
            return false;
    }
}

// "1 GiB" for the usual limit, the exact number of bytes for others.
std::string SizeText(std::size_t bytes) {
    constexpr std::size_t kGiB = std::size_t{1} << 30;
    return bytes % kGiB == 0 ? std::to_string(bytes / kGiB) + " GiB"
                             : std::to_string(bytes) + " bytes";
}

}  // namespace

CSxStream::CSxStream(std::string data) : m_data(std::move(data)) {
    if (m_data.starts_with(kByteOrderMark))
        m_data.erase(0, kByteOrderMark.size());
}

CSxStream CSxStream::FromFile(const std::string& path, std::size_t maxBytes) {
    const int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0)
        throw CFileException(path, std::strerror(errno));
    std::string data;
    struct stat info {};
    if (::fstat(fd, &info) == 0 && S_ISREG(info.st_mode) &&
        static_cast<std::size_t>(info.st_size) <= maxBytes) {
        data.reserve(static_cast<std::size_t>(info.st_size) + 1);
    }
    bool complete = false;
    try {
        complete = ReadUpTo(fd, maxBytes, data, path);
    } catch (...) {
        ::close(fd);
        throw;
    }
    ::close(fd);
    if (!complete)
        throw CSequenceFileTooLarge(path, "more than " + SizeText(maxBytes) +
                                              "; sequence files are read up to " +
                                              SizeText(maxBytes));
    return CSxStream(std::move(data));
}

bool CSxStream::ReadLine(std::string& line) {
    if (m_pos >= m_data.size())
        return false;
    m_lastLineStart = m_pos;
    std::size_t end = m_data.find_first_of("\r\n", m_pos);
    if (end == std::string::npos)
        end = m_data.size();
    line.assign(m_data, m_pos, end - m_pos);
    m_pos = end;
    if (m_pos < m_data.size()) {
        char first = m_data[m_pos++];
        char pair = first == '\r' ? '\n' : '\r';
        if (m_pos < m_data.size() && m_data[m_pos] == pair)
            ++m_pos;
    }
    ++m_lineNumber;
    return true;
}

void CSxStream::UnreadLine() {
    if (m_pos == m_lastLineStart)
        return;
    m_pos = m_lastLineStart;
    --m_lineNumber;
}

void CSxStream::Rewind() {
    m_pos = 0;
    m_lastLineStart = 0;
    m_lineNumber = 0;
    m_recordLine = 0;
    m_problemLine = 0;
}
