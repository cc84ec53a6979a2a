#pragma once
// Tests that save onto /dev/null or /dev/full run as the superuser too, where a faulty save
// could replace the device by a regular file. The guard notes the device and, should that have
// happened, puts it back when it goes, so the machine survives the failing test.

#include <sys/stat.h>
#include <unistd.h>

#include <string>

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
