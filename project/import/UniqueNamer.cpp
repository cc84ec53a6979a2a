#include "import/UniqueNamer.h"

namespace {

// The number after the last '#', when that text is all digits and not zero; else 0.
long SuffixNumber(const std::string& name, std::size_t hash) {
    std::string digits = name.substr(hash + 1);
    if (digits.empty() || digits.size() > 9)
        return 0;
    for (char c : digits) {
        if (c < '0' || c > '9')
            return 0;
    }
    return std::stol(digits);
}

}  // namespace

CUniqueNamer::CUniqueNamer(const std::vector<std::string>& names) {
    for (const std::string& name : names)
        Note(name);
}

void CUniqueNamer::Count(const std::string& base, long k) {
    long& count = m_counts.try_emplace(base, 1).first->second;
    ++count;
    if (count <= k)
        count = k + 1;
}

void CUniqueNamer::Note(const std::string& name) {
    // A name counts for itself with no suffix, and, when it ends in "#k", for the text before.
    Count(name, 0);
    std::size_t hash = name.rfind('#');
    if (hash == std::string::npos)
        return;
    if (long k = SuffixNumber(name, hash))
        Count(name.substr(0, hash), k);
}

std::string CUniqueNamer::Take(const std::string& wanted) {
    auto found = m_counts.find(wanted);
    long count = found == m_counts.end() ? 1 : found->second;
    std::string name = count >= 2 ? wanted + "#" + std::to_string(count) : wanted;
    Note(name);
    return name;
}
