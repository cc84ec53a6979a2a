#pragma once
// How much memory the system can still give: the figures of /proc/meminfo, read at most a few
// times a second during a search.

#include <atomic>
#include <chrono>
#include <cstdint>
#include <limits>
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

// The bytes this process can still allocate: what the system has available, or less when the
// process's address space is limited (ulimit -v); nothing when the system does not tell.
std::optional<std::uint64_t> AvailableMemoryBytes();

// The low-memory state, refreshed from the system at most every `interval`. Thread-safe without
// a lock: the search asks at every step of every worker, and one caller at a time refreshes
// while the others take the state last read.
class CMemoryWatch {
  public:
    explicit CMemoryWatch(std::chrono::milliseconds interval = std::chrono::milliseconds(100))
        : m_interval(interval) {}
    bool IsLow();

  private:
    std::chrono::milliseconds m_interval;
    // When the next refresh is due, in steady-clock nanoseconds.
    std::atomic<std::int64_t> m_nextRead{std::numeric_limits<std::int64_t>::min()};
    std::atomic<bool> m_low{false};
};
