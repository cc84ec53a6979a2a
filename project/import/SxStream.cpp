#include "import/SxStream.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <optional>

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

// Reads the descriptor to its end, or none when it holds more than `maxBytes`. The data is
// gathered in pieces and joined once complete, so that neither an endless input nor the
// growth of one buffer takes much more memory than the limit.
std::optional<std::string> ReadUpTo(int fd, std::size_t maxBytes, const std::string& path) {
    constexpr std::size_t kPiece = std::size_t{1} << 20;
    std::vector<std::string> pieces;
    std::size_t total = 0;
    for (;;) {
        if (pieces.empty() || pieces.back().size() == kPiece) {
            pieces.emplace_back();
            pieces.back().reserve(kPiece);
        }
        std::string& piece = pieces.back();
        const std::size_t old = piece.size();
        piece.resize(kPiece);
        const ssize_t got = ::read(fd, piece.data() + old, kPiece - old);
        piece.resize(old + static_cast<std::size_t>(std::max<ssize_t>(got, 0)));
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0)
            throw CFileException(path, std::strerror(errno));
        if (got == 0)
            break;
        total += static_cast<std::size_t>(got);
        // One byte beyond the limit tells a file of exactly the limit from a larger one.
        if (total > maxBytes)
            return std::nullopt;
    }
    std::string data;
    data.reserve(total);
    for (std::string& piece : pieces) {
        data += piece;
        std::string().swap(piece);
    }
    return data;
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
    std::optional<std::string> data;
    try {
        data = ReadUpTo(fd, maxBytes, path);
    } catch (...) {
        ::close(fd);
        throw;
    }
    ::close(fd);
    if (!data) {
        throw CSequenceFileTooLarge(path, "more than " + SizeText(maxBytes) +
                                              "; sequence files are read up to " +
                                              SizeText(maxBytes));
    }
    return CSxStream(std::move(*data));
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
