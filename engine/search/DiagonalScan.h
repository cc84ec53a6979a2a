#pragma once
// Phase three of the search: the blocks of one multi-molecule diagonal.
//
// Member t's residue p lies in column p + L - offset t. For every pair of members the best
// runs of their overlap that reach the cutoff join the two members over those columns. At each
// column the members fall into groups (connected through joins); a group that stays the same
// over at least two columns and has at least the minimum number of members is a block. Groups
// only change where a joined run starts or ends, so only those columns are examined.

#include <cstdint>
#include <memory>
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

// Two molecules in one relative placement: residue p of the first faces residue p + offset of
// the second over positions [first, end) of the first.
struct CPairJoin {
    int first = 0;
    std::vector<CJoinedRun> runs;      // in positions of the first molecule
    std::vector<std::int64_t> prefix;  // prefix[k]: the scores of positions first..first+k-1
    // The summed scores of positions [begin, end) of the first molecule.
    std::int64_t Sum(int begin, int end) const {
        return prefix[end - first] - prefix[begin - first];
    }
};

// What two molecules in one relative placement give depends on nothing else, and the diagonals
// of a search share most of their placements: each is worked out once per search.
class CJoinedRunCache {
  public:
    CJoinedRunCache(const std::vector<const std::vector<std::uint8_t>*>& sequences,
                    const CScoreGrid& grid, int cutoff)
        : m_sequences(sequences),
          m_grid(grid),
          m_cutoff(cutoff),
          m_byPair(sequences.size() * sequences.size()) {}

    // Molecules a and b with residue p of a facing residue p + offset of b. The reference stays
    // valid as long as the cache.
    const CPairJoin& Join(int a, int b, int offset);
    int Length(int molecule) const { return static_cast<int>(m_sequences[molecule]->size()); }
    const std::uint8_t* Residues(int molecule) const { return m_sequences[molecule]->data(); }

  private:
    const std::vector<const std::vector<std::uint8_t>*>& m_sequences;
    const CScoreGrid& m_grid;
    int m_cutoff;
    // Per molecule pair a * count + b, the placements worked out so far: a pair has a few hit
    // offsets, so a short list beats hashing.
    struct CPlacements {
        std::vector<std::int32_t> offsets;
        std::vector<std::unique_ptr<CPairJoin>> joins;
    };
    std::vector<CPlacements> m_byPair;
};

// Appends the blocks of `diagonal` in the order they are made. `longest` is the length of the
// longest molecule of the search; `minSequences` is at least 2.
void ScanDiagonal(const CSimDiag& diagonal, int longest, int minSequences, CJoinedRunCache& joins,
                  std::vector<CBlockCandidate>& blocks);
