#include "archive/FileIO.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

std::string ErrnoText() { return std::strerror(errno); }

std::string FolderOf(const std::string& path) {
    auto slash = path.find_last_of('/');
    if (slash == std::string::npos) return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

void WriteAll(int fd, const std::uint8_t* data, std::size_t size, const std::string& path) {
    while (size > 0) {
        ssize_t written = ::write(fd, data, size);
        if (written < 0) {
            if (errno == EINTR) continue;
            throw CFileException(path, ErrnoText());
        }
        data += written;
        size -= static_cast<std::size_t>(written);
    }
}

}  // namespace

std::vector<std::uint8_t> ReadWholeFile(const std::string& path, std::size_t maxBytes) {
    std::FILE* file = std::fopen(path.c_str(), "rb");
    if (!file) throw CFileException(path, ErrnoText());
    std::vector<std::uint8_t> bytes;
    std::uint8_t chunk[65536];
    std::size_t got = 0;
    while ((got = std::fread(chunk, 1, sizeof chunk, file)) > 0) {
        if (bytes.size() + got > maxBytes) {
            std::fclose(file);
            throw CFileException(path, "file too large");
        }
        bytes.insert(bytes.end(), chunk, chunk + got);
    }
    bool failed = std::ferror(file) != 0;
    std::fclose(file);
    if (failed) throw CFileException(path, "read error");
    return bytes;
}

void WriteFileAtomically(const std::string& path, std::span<const std::uint8_t> bytes) {
    std::string temp = FolderOf(path) + "/." + FileNameOf(path) + ".XXXXXX";
    int fd = ::mkstemp(temp.data());
    if (fd < 0) throw CFileException(path, ErrnoText());
    try {
        WriteAll(fd, bytes.data(), bytes.size(), path);
        // Keep the permissions of the file being replaced; new files get the usual 0666 & umask.
        struct stat existing {};
        if (::stat(path.c_str(), &existing) == 0) {
            ::fchmod(fd, existing.st_mode & 07777);
        } else {
            mode_t mask = ::umask(0);
            ::umask(mask);
            ::fchmod(fd, 0666 & ~mask);
        }
        if (::fsync(fd) != 0) throw CFileException(path, ErrnoText());
        if (::close(fd) != 0) {
            fd = -1;
            throw CFileException(path, ErrnoText());
        }
        fd = -1;
        if (::rename(temp.c_str(), path.c_str()) != 0) throw CFileException(path, ErrnoText());
    } catch (...) {
        if (fd >= 0) ::close(fd);
        ::unlink(temp.c_str());
        throw;
    }
}

void WriteFileAtomically(const std::string& path, const std::string& text) {
    WriteFileAtomically(
        path, std::span(reinterpret_cast<const std::uint8_t*>(text.data()), text.size()));
}

std::string FileNameOf(const std::string& path) {
    auto slash = path.find_last_of('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

std::string BaseNameOf(const std::string& path) {
    std::string name = FileNameOf(path);
    auto dot = name.find_last_of('.');
    return dot == std::string::npos ? name : name.substr(0, dot);
}
