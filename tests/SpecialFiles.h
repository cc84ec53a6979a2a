#pragma once
// Devices and FIFOs for the tests of saving onto them, made safe against the very faults the
// tests look for: a faulty save must fail the test, not break the machine or hang.

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <string>
#include <thread>

// Tests that save onto /dev/null or /dev/full run as the superuser too, where a faulty save
// could replace the device by a regular file. The guard notes the device and, should that have
// happened, puts it back when it goes.

class CDeviceGuard {
  public:
    explicit CDeviceGuard(std::string path) : m_path(std::move(path)) {
        m_present = ::stat(m_path.c_str(), &m_before) == 0 && S_ISCHR(m_before.st_mode);
    }
    ~CDeviceGuard() {
        if (m_present && !Intact()) {
            ::unlink(m_path.c_str());
            ::mknod(m_path.c_str(), S_IFCHR | 0666, m_before.st_rdev);
            ::chmod(m_path.c_str(), m_before.st_mode & 07777);
        }
    }
    CDeviceGuard(const CDeviceGuard&) = delete;
    CDeviceGuard& operator=(const CDeviceGuard&) = delete;

    // The device was there to begin with.
    bool Present() const { return m_present; }
    // It still is: a character device with the same device number.
    bool Intact() const {
        struct stat now {};
        return ::lstat(m_path.c_str(), &now) == 0 && S_ISCHR(now.st_mode) &&
               now.st_rdev == m_before.st_rdev;
    }

  private:
    std::string m_path;
    struct stat m_before {};
    bool m_present = false;
};

// Reads everything written into a FIFO, on a thread of its own. A faulty save that replaced the
// FIFO instead of writing into it would leave the reader waiting for a writer forever; Take()
// then opens the FIFO for writing under a second name kept for that, so the reader sees the
// end of the data and the test fails instead of hanging.
class CFifoReader {
  public:
    explicit CFifoReader(const std::string& path) : m_spare(path + ".spare") {
        if (::link(path.c_str(), m_spare.c_str()) != 0)
            m_spare.clear();
        m_thread = std::thread([this, path] {
            const int fd = ::open(path.c_str(), O_RDONLY);
            char buffer[65536];
            for (ssize_t got; fd >= 0 && (got = ::read(fd, buffer, sizeof buffer)) > 0;)
                m_text.append(buffer, static_cast<std::size_t>(got));
            if (fd >= 0)
                ::close(fd);
            m_done = true;
        });
    }
    ~CFifoReader() {
        if (m_thread.joinable())
            Take();
    }
    CFifoReader(const CFifoReader&) = delete;
    CFifoReader& operator=(const CFifoReader&) = delete;

    // What the reader received, once every writer has gone.
    std::string Take() {
        // A writer opening without blocking succeeds once the reader waits; closing it at
        // once ends a wait that no save will end.
        while (!m_done && !m_spare.empty()) {
            const int fd = ::open(m_spare.c_str(), O_WRONLY | O_NONBLOCK);
            if (fd >= 0) {
                ::close(fd);
                break;
            }
            std::this_thread::yield();
        }
        m_thread.join();
        if (!m_spare.empty())
            ::unlink(m_spare.c_str());
        return m_text;
    }

  private:
    std::string m_spare;
    std::string m_text;
    std::atomic<bool> m_done = false;
    std::thread m_thread;
};
