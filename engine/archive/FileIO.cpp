#include "archive/FileIO.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <cerrno>
#include <cstdio>
#include <cstring>

namespace {

// Links followed at most before giving up, as the system does.
constexpr int kMaxLinkHops = 40;
// Room left in a file name for the temporary file's dot and suffix.
constexpr std::size_t kMaxTempStem = 200;

std::string ErrnoText(int error = errno) {
    return std::strerror(error);
}

std::string FolderOf(const std::string& path) {
    auto slash = path.find_last_of('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

void WriteAll(int fd, const std::uint8_t* data, std::size_t size, const std::string& path) {
    while (size > 0) {
        ssize_t written = ::write(fd, data, size);
        if (written < 0) {
            if (errno == EINTR)
                continue;
            throw CFileException(path, ErrnoText());
        }
        data += written;
        size -= static_cast<std::size_t>(written);
    }
}

// The text of the symbolic link `link`, relative links taken from the link's folder.
std::string LinkTarget(const std::string& link, const std::string& reported) {
    std::vector<char> text(256);
    for (;;) {
        const ssize_t size = ::readlink(link.c_str(), text.data(), text.size());
        if (size < 0)
            throw CFileException(reported, ErrnoText());
        if (static_cast<std::size_t>(size) < text.size()) {
            std::string target(text.data(), static_cast<std::size_t>(size));
            return target.starts_with('/') ? target : FolderOf(link) + "/" + target;
        }
        text.resize(text.size() * 2);
    }
}

// The file that symbolic links starting at `path` lead to (it need not exist yet: a dangling
// link names the file a save creates). `existing` gets its status when it exists.
std::string FollowLinks(const std::string& path, bool& exists, struct stat& existing) {
    std::string current = path;
    for (int hop = 0; hop <= kMaxLinkHops; ++hop) {
        if (::lstat(current.c_str(), &existing) != 0) {
            if (errno != ENOENT)
                throw CFileException(path, ErrnoText());
            exists = false;
            return current;
        }
        if (!S_ISLNK(existing.st_mode)) {
            exists = true;
            return current;
        }
        current = LinkTarget(current, path);
    }
    throw CFileException(path, ErrnoText(ELOOP));
}

// Devices, FIFOs and pipes are written where they are: renaming a file over them would
// replace them.
void WriteInPlace(const std::string& path, std::span<const std::uint8_t> bytes) {
    const int fd = ::open(path.c_str(), O_WRONLY | O_TRUNC | O_NOCTTY | O_CLOEXEC);
    if (fd < 0)
        throw CFileException(path, ErrnoText());
    try {
        WriteAll(fd, bytes.data(), bytes.size(), path);
    } catch (...) {
        ::close(fd);
        throw;
    }
    if (::close(fd) != 0)
        throw CFileException(path, ErrnoText());
}

// Writes a temporary file beside `target`, flushes it and renames it over `target`.
// `reported` is the path the caller named, for messages.
void ReplaceAtomically(const std::string& target, const std::string& reported, bool exists,
                       const struct stat& existing, std::span<const std::uint8_t> bytes) {
    std::string temp =
        FolderOf(target) + "/." + FileNameOf(target).substr(0, kMaxTempStem) + ".XXXXXX";
    int fd = ::mkstemp(temp.data());
    if (fd < 0)
        throw CFileException(reported, ErrnoText());
    try {
        WriteAll(fd, bytes.data(), bytes.size(), reported);
        // Keep the permissions of the file being replaced; new files get the usual 0666 & umask.
        if (exists) {
            ::fchmod(fd, existing.st_mode & 07777);
        } else {
            mode_t mask = ::umask(0);
            ::umask(mask);
            ::fchmod(fd, 0666 & ~mask);
        }
        if (::fsync(fd) != 0)
            throw CFileException(reported, ErrnoText());
        const int closed = ::close(fd);
        fd = -1;
        if (closed != 0)
            throw CFileException(reported, ErrnoText());
        if (::rename(temp.c_str(), target.c_str()) != 0)
            throw CFileException(reported, ErrnoText());
    } catch (...) {
        if (fd >= 0)
            ::close(fd);
        ::unlink(temp.c_str());
        throw;
    }
}

}  // namespace

std::vector<std::uint8_t> ReadWholeFile(const std::string& path, std::size_t maxBytes) {
    std::FILE* file = std::fopen(path.c_str(), "rb");
    if (!file)
        throw CFileException(path, ErrnoText());
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
    if (failed)
        throw CFileException(path, "read error");
    return bytes;
}

void WriteFileAtomically(const std::string& path, std::span<const std::uint8_t> bytes) {
    // Whatever the path leads to decides: stat follows every link, /proc's own included.
    struct stat status {};
    if (::stat(path.c_str(), &status) == 0) {
        if (!S_ISREG(status.st_mode)) {
            WriteInPlace(path, bytes);
            return;
        }
    } else if (errno != ENOENT) {
        throw CFileException(path, ErrnoText());
    }
    bool exists = false;
    const std::string target = FollowLinks(path, exists, status);
    ReplaceAtomically(target, path, exists, status, bytes);
}

void WriteFileAtomically(const std::string& path, const std::string& text) {
    WriteFileAtomically(path,
                        std::span(reinterpret_cast<const std::uint8_t*>(text.data()), text.size()));
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
