#pragma once
// Phase three of the search: the blocks of one multi-molecule diagonal.
//
// Member t's residue p lies in column p + L - offset t. For every pair of members the best
// runs of their overlap that reach the cutoff join the two members over those columns. At each
// column the members fall into groups (connected through joins); a group that stays the same
// over at least two columns and has at least the minimum number of members is a block. Groups
// only change where a joined run starts or ends, so only those columns are examined.

#include <cstdint>
#include <vector>

#include "SimDiag.h"
#include "search/ScoreGrid.h"

struct CBlockCandidate {
    std::vector<std::int32_t> molecules;  // increasing
    std::vector<std::int32_t> starts;     // 0-based position in each molecule
    int width = 0;
    int score = 0;  // sum over columns and member pairs of grid(upper row member, lower one)
};

// A run of the overlap of two members, in overlap positions [begin, end).
struct CJoinedRun {
    int begin;
    int end;
};

// The runs that join two aligned residue strings: each maximal stretch whose running sum stays
// at or above 0 contributes its best-scoring prefix-run when that reaches the cutoff; scanning
// resumes after the residue that follows a kept run.
void FindJoinedRuns(const std::uint8_t* a, const std::uint8_t* b, int length,
                    const CScoreGrid& grid, int cutoff, std::vector<CJoinedRun>& runs);

// Appends the blocks of `diagonal` in the order they are made. `minSequences` is at least 2.
void ScanDiagonal(const CSimDiag& diagonal,
                  const std::vector<const std::vector<std::uint8_t>*>& sequences, int longest,
                  const CScoreGrid& grid, int cutoff, int minSequences,
                  std::vector<CBlockCandidate>& blocks);
