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
        : std::runtime_error(path + ": " + reason), m_path(path), m_reason(reason) {}
    const std::string& Path() const { return m_path; }
    // Why, without the path: the system's text ("Permission denied") or our own.
    const std::string& Reason() const { return m_reason; }

  private:
    std::string m_path;
    std::string m_reason;
};

// Reads a whole file. Throws CFileException when it cannot be read or exceeds maxBytes.
std::vector<std::uint8_t> ReadWholeFile(const std::string& path,
                                        std::size_t maxBytes = std::size_t{1} << 31);

// Saves `bytes` at `path`. A regular file or a new path is replaced atomically: the bytes go to a
// temporary file in the target's folder, are flushed to disk and renamed over the target, so a
// failed save never destroys the previous file. Symbolic links are followed and stay links: the
// file they lead to is replaced (or created, for a dangling link). Devices, FIFOs and pipes are
// written in place. Throws CFileException with the system's reason ("No space left on device").
void WriteFileAtomically(const std::string& path, std::span<const std::uint8_t> bytes);
void WriteFileAtomically(const std::string& path, const std::string& text);

// The file name without its folder ("a/b/c.txt" -> "c.txt").
std::string FileNameOf(const std::string& path);
// The file name without folder and extension ("a/b/c.tar.txt" -> "c.tar").
std::string BaseNameOf(const std::string& path);
