#include "search/MemoryStatus.h"

#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <fstream>
#include <map>
#include <sstream>

std::optional<CMemoryFigures> ParseMemInfo(const std::string& text) {
    std::map<std::string, std::uint64_t> values;
    std::istringstream lines(text);
    std::string line;
    while (std::getline(lines, line)) {
        const auto colon = line.find(':');
        if (colon == std::string::npos)
            continue;
        std::istringstream number(line.substr(colon + 1));
        std::uint64_t kb = 0;
        if (number >> kb)
            values[line.substr(0, colon)] = kb;
    }
    if (!values.count("MemTotal") || !values.count("MemAvailable"))
        return std::nullopt;
    return CMemoryFigures{values["MemAvailable"] + values["SwapFree"],
                          values["MemTotal"] + values["SwapTotal"]};
}

bool IsLowOnMemory(const CMemoryFigures& figures) {
    return figures.availableKb < figures.totalKb / 20;
}

namespace {

std::optional<CMemoryFigures> ReadSystemFigures() {
    std::ifstream file("/proc/meminfo");
    std::stringstream text;
    text << file.rdbuf();
    return ParseMemInfo(text.str());
}

// What the address-space limit leaves this process, if it has one.
std::optional<std::uint64_t> AddressSpaceLeft() {
    rlimit limit{};
    if (getrlimit(RLIMIT_AS, &limit) != 0 || limit.rlim_cur == RLIM_INFINITY)
        return std::nullopt;
    std::ifstream statm("/proc/self/statm");
    std::uint64_t pages = 0;
    if (!(statm >> pages))
        return std::nullopt;
    const std::uint64_t used = pages * static_cast<std::uint64_t>(sysconf(_SC_PAGESIZE));
    return limit.rlim_cur > used ? limit.rlim_cur - used : 0;
}

}  // namespace

std::optional<std::uint64_t> AvailableMemoryBytes() {
    const auto figures = ReadSystemFigures();
    const auto left = AddressSpaceLeft();
    if (!figures)
        return left;
    const std::uint64_t available = figures->availableKb * 1024;
    return left ? std::min(available, *left) : available;
}

bool CMemoryWatch::IsLow() {
    using std::chrono::nanoseconds;
    const std::int64_t now =
        nanoseconds(std::chrono::steady_clock::now().time_since_epoch()).count();
    std::int64_t due = m_nextRead.load(std::memory_order_relaxed);
    if (now < due ||
        !m_nextRead.compare_exchange_strong(due, now + nanoseconds(m_interval).count()))
        return m_low.load(std::memory_order_relaxed);
    const auto figures = ReadSystemFigures();
    // Without the figures the search goes on: it cannot tell, and must not refuse to run.
    const bool low = figures && IsLowOnMemory(*figures);
    m_low.store(low, std::memory_order_relaxed);
    return low;
}
