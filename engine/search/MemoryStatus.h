#pragma once
// How much memory the system can still give: the figures of /proc/meminfo, read at most a few
// times a second during a search.

#include <chrono>
#include <cstdint>
#include <mutex>
#include <optional>
#include <string>

struct CMemoryFigures {
    std::uint64_t availableKb = 0;  // MemAvailable + SwapFree
    std::uint64_t totalKb = 0;      // MemTotal + SwapTotal
};

// The figures of a /proc/meminfo text; nothing when MemTotal or MemAvailable is missing.
std::optional<CMemoryFigures> ParseMemInfo(const std::string& text);
// Less than a twentieth of all memory is still available.
bool IsLowOnMemory(const CMemoryFigures& figures);

// The low-memory state, refreshed from the system at most every `interval`. Thread-safe.
class CMemoryWatch {
  public:
    explicit CMemoryWatch(std::chrono::milliseconds interval = std::chrono::milliseconds(100))
        : m_interval(interval) {}
    bool IsLow();

  private:
    std::mutex m_mutex;
    std::chrono::milliseconds m_interval;
    std::chrono::steady_clock::time_point m_lastRead{};
    bool m_read = false;
    bool m_low = false;
};
