#pragma once
// Whole-file reading and atomic replacement of files.

#include <cstddef>
#include <cstdint>
#include <span>
#include <stdexcept>
#include <string>
#include <vector>

// A file could not be opened, read or written.
class CFileException : public std::runtime_error {
public:
    CFileException(const std::string& path, const std::string& reason)
        : std::runtime_error(path + ": " + reason), m_path(path) {}
    const std::string& Path() const { return m_path; }

private:
    std::string m_path;
};

// Reads a whole file. Throws CFileException when it cannot be read or exceeds maxBytes.
std::vector<std::uint8_t> ReadWholeFile(const std::string& path,
                                        std::size_t maxBytes = std::size_t{1} << 31);

// Writes `bytes` to a new temporary file in the target's folder, flushes it to disk and renames
// it over `path`, so a failed save never destroys the previous file. Throws CFileException.
void WriteFileAtomically(const std::string& path, std::span<const std::uint8_t> bytes);
void WriteFileAtomically(const std::string& path, const std::string& text);

// The file name without its folder ("a/b/c.txt" -> "c.txt").
std::string FileNameOf(const std::string& path);
// The file name without folder and extension ("a/b/c.tar.txt" -> "c.tar").
std::string BaseNameOf(const std::string& path);
