#pragma once
// Phase three of the search: the blocks of one multi-molecule diagonal.
//
// Member t's residue p lies in column p + L - offset t. For every pair of members the best
// runs of their overlap that reach the cutoff join the two members over those columns. At each
// column the members fall into groups (connected through joins); a group that stays the same
// over at least two columns and has at least the minimum number of members is a block. Groups
// only change where a joined run starts or ends, so only those columns are examined.

#include <atomic>
#include <cstdint>
#include <functional>
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
};

// What two molecules in one relative placement give depends on nothing else, and the diagonals
// of a search share most of their placements. Every two members of a diagonal sit at the offset
// of one of their hits, so each hit placement has a slot, worked out by the first worker that
// needs it and shared by all. Thread-safe.
class CPlacementJoins {
  public:
    // `pairOffsets[a][b]` (a < b) lists the hit offsets of the pair in increasing order. The
    // sequences and the grid must outlive this object.
    CPlacementJoins(const std::vector<const std::vector<std::uint8_t>*>& sequences,
                    const CScoreGrid& grid, int cutoff,
                    const std::vector<std::vector<std::vector<std::int32_t>>>& pairOffsets);

    // Molecules a < b with residue p of a facing residue p + offset of b, where offset is one of
    // their hit offsets (std::logic_error otherwise).
    const CPairJoin& Join(int a, int b, int offset);

  private:
    enum : std::uint8_t { kMissing, kWorking, kReady };
    std::size_t IndexOf(int a, int b, int offset) const;

    const std::vector<const std::vector<std::uint8_t>*>& m_sequences;
    const CScoreGrid& m_grid;
    int m_cutoff;
    std::size_t m_count;  // molecules
    // The hit offsets of pair a < b are m_offsets[m_firstOfPair[p] .. m_firstOfPair[p + 1]) with
    // p = a * m_count + b; m_joins and m_states hold their joins at the same indices.
    std::vector<std::size_t> m_firstOfPair;
    std::vector<std::int32_t> m_offsets;
    std::vector<CPairJoin> m_joins;
    std::unique_ptr<std::atomic<std::uint8_t>[]> m_states;
};

// Appends the blocks of `diagonal` in the order they are made. `longest` is the length of the
// longest molecule of the search; `minSequences` is at least 2. `shouldAbort` is asked before
// each member pair's join; when it answers true the result is false and `blocks` incomplete.
bool ScanDiagonal(const CSimDiag& diagonal, int longest, int minSequences, CPlacementJoins& joins,
                  const std::function<bool()>& shouldAbort, std::vector<CBlockCandidate>& blocks);
