#include "search/MemoryStatus.h"

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

bool CMemoryWatch::IsLow() {
    const std::lock_guard<std::mutex> lock(m_mutex);
    const auto now = std::chrono::steady_clock::now();
    if (m_read && now - m_lastRead < m_interval)
        return m_low;
    m_read = true;
    m_lastRead = now;
    std::ifstream file("/proc/meminfo");
    std::stringstream text;
    text << file.rdbuf();
    const auto figures = ParseMemInfo(text.str());
    // Without the figures the search goes on: it cannot tell, and must not refuse to run.
    m_low = figures && IsLowOnMemory(*figures);
    return m_low;
}
