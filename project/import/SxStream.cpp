#include "import/SxStream.h"

#include "archive/FileIO.h"

CSxStream CSxStream::FromFile(const std::string& path) {
    std::vector<std::uint8_t> bytes = ReadWholeFile(path);
    return CSxStream(std::string(bytes.begin(), bytes.end()));
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
}
