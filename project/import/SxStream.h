#pragma once
// A sequence file held in memory and read line by line.

#include <cstddef>
#include <string>
#include <vector>

class CSxStream {
  public:
    explicit CSxStream(std::string data) : m_data(std::move(data)) {}
    // Reads the file; throws CFileException when it cannot be read.
    static CSxStream FromFile(const std::string& path);

    // The next line without its end. LF, CR, CR LF and LF CR each end one line. False only at
    // the end of the data with nothing read (a last line without an end is still a line).
    bool ReadLine(std::string& line);
    // Steps back over the line just read, so the next ReadLine returns it again and the line
    // count does not count it twice. Only one line can be stepped back.
    void UnreadLine();
    // Back to the first line; the line count starts again at 0.
    void Rewind();
    // Lines read so far: the number of the last line read, the first line being 1.
    int LineNumber() const { return m_lineNumber; }

  private:
    std::string m_data;
    std::size_t m_pos = 0;
    std::size_t m_lastLineStart = 0;
    int m_lineNumber = 0;
};
