#pragma once
// Molecule entries for searches of hand-made sequences: keys K0, K1, ... and names m0, m1, ...

#include <string>
#include <vector>

#include "SxMolEntry.h"

inline std::vector<CSxMolEntry> Entries(const std::vector<std::string>& sequences) {
    std::vector<CSxMolEntry> entries;
    for (std::size_t i = 0; i < sequences.size(); ++i) {
        entries.emplace_back("K" + std::to_string(i), "m" + std::to_string(i), sequences[i]);
    }
    return entries;
}
