#pragma once
// A sequence file held in memory and read line by line.

#include <cstddef>
#include <string>
#include <vector>

#include "archive/FileIO.h"

// The most a sequence file may hold. Files are read whole, so a device, an endless pipe or a
// file far beyond any real sequence collection stops here instead of filling the memory.
constexpr std::size_t kMaxSequenceFileBytes = std::size_t{1} << 30;

// Thrown by CSxStream::FromFile when the file holds more than the limit.
class CSequenceFileTooLarge : public CFileException {
  public:
    using CFileException::CFileException;
};

class CSxStream {
  public:
    // A UTF-8 byte order mark before the first line is dropped.
    explicit CSxStream(std::string data);
    // Reads the file, at most `maxBytes` of it; throws CSequenceFileTooLarge when there is
    // more, CFileException when it cannot be read.
    static CSxStream FromFile(const std::string& path,
                              std::size_t maxBytes = kMaxSequenceFileBytes);

    // The next line without its end. LF, CR, CR LF and LF CR each end one line. False only at
    // the end of the data with nothing read (a last line without an end is still a line).
    bool ReadLine(std::string& line);
    // Steps back over the line just read, so the next ReadLine returns it again and the line
    // count does not count it twice. Only one line can be stepped back.
    void UnreadLine();
    // Back to the first line; the line count starts again at 0.
    void Rewind();
    // Whether every line has been read.
    bool AtEnd() const { return m_pos >= m_data.size(); }
    // Lines read so far: the number of the last line read, the first line being 1.
    int LineNumber() const { return m_lineNumber; }

    // The readers note where the record they read begins (its header line) and where they
    // found what made it unreadable, so that a skipped record can be pointed out.
    void MarkRecordStart() {
        m_recordLine = m_lineNumber;
        m_problemLine = m_lineNumber;
    }
    void MarkProblem() { m_problemLine = m_lineNumber; }
    int RecordLine() const { return m_recordLine; }
    int ProblemLine() const { return m_problemLine; }

  private:
    std::string m_data;
    std::size_t m_pos = 0;
    std::size_t m_lastLineStart = 0;
    int m_lineNumber = 0;
    int m_recordLine = 0;
    int m_problemLine = 0;
};
