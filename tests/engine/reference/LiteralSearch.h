#pragma once
// The block search exactly as its algorithm is written: a direct, slow transcription of the
// three phases, used to check the fast engine. Phase two is the plain depth-first expansion,
// which is exponential on families of similar sequences: keep its inputs small.

#include <cstdint>
#include <span>
#include <vector>

#include "SimDiag.h"

namespace literal {

// A square score table over codes 1..size, row by row.
struct CTable {
    int size = 0;
    std::vector<int> scores;
    int operator()(std::uint8_t row, std::uint8_t col) const {
        return scores[(row - 1) * size + (col - 1)];
    }
};

struct CBlock {
    std::vector<int> molecules;
    std::vector<int> starts;
    int width = 0;
    int score = 0;
    int made = 0;  // how many blocks were made before this one
    bool operator==(const CBlock&) const = default;
};

struct CResult {
    std::vector<CSimHit> hits;
    std::vector<CSimDiag> diagonals;
    std::vector<CBlock> blocks;  // in block-set order
};

// Phase one for one pair: the offsets of its diagonals with a hit, ascending.
std::vector<int> ComparePair(const CTable& table, int cutoff, const std::vector<std::uint8_t>& a,
                             const std::vector<std::uint8_t>& b);

// Runs the three phases on encoded sequences.
CResult Search(const CTable& table, int cutoff, int minSequences,
               const std::vector<std::vector<std::uint8_t>>& sequences);

// The n-th elementary symmetric sum by nested loops over every choice of n lengths.
double SearchSpace(std::span<const double> lengths, int n);

}  // namespace literal
