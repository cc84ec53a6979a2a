#pragma once
// Phase two of the search: the maximal multi-molecule diagonals grown from one hit.
//
// A diagonal is a set of placements (molecule, offset) in which every two members have a hit at
// their relative offset, that is a clique of the graph whose vertices are placements. The
// diagonals kept for hit (i, j, d) are the maximal cliques that hold (i, 0) and (j, d) and whose
// other members are molecules above j, with at least the minimum number of members. They are
// enumerated with Bron-Kerbosch (with pivoting): candidates are the placements of molecules
// above j that agree with the hit, and placements of the other molecules below j that agree
// with it only stop a clique from being maximal. The cliques of one hit are returned ordered by
// their (member, offset) sequences, the order in which a depth-first expansion that adds
// molecules in increasing order, and offsets in increasing order, would keep them.

#include <atomic>
#include <cstdint>
#include <functional>
#include <optional>
#include <vector>

#include "SimDiag.h"
#include "search/HitMasks.h"

class CDiagonalExpander {
  public:
    // `pairOffsets[a][b]` (a < b) lists the hit offsets of the pair in increasing order. The
    // approximate memory of every diagonal found is added to `heldBytes` (shared by the
    // expanders of one search, so a budget can be watched while they run), and so is the
    // expansion's own table while it is held.
    CDiagonalExpander(const CHitMasks& masks,
                      const std::vector<std::vector<std::vector<std::int32_t>>>& pairOffsets,
                      int minSequences, std::atomic<std::size_t>& heldBytes);

    // Appends the diagonals of `hit` to `kept`. `shouldAbort` is asked before the expansion
    // allocates its table, while it fills it and at every step of the search; when it answers
    // true nothing more is appended and the result is false.
    bool Expand(const CSimHit& hit, const std::function<bool()>& shouldAbort,
                std::vector<CSimDiag>& kept);
    static std::size_t BytesOf(const CSimDiag& diagonal);

  private:
    struct CPlacement {
        int molecule;
        std::int32_t offset;
    };
    using CVertexSet = std::vector<std::uint64_t>;

    void CollectPlacements(const CSimHit& hit);
    bool Joins(const CPlacement& a, const CPlacement& b) const;
    // An excluded placement that agrees with every candidate makes every diagonal of the hit
    // extendable, so none is maximal. Nothing when told to abort.
    std::optional<bool> SomeExcludedJoinsEveryCandidate() const;
    // Fills the table of which placements join (m_words per placement); false when told to abort.
    bool BuildAdjacency();
    bool Search(std::vector<int>& clique, CVertexSet candidates, CVertexSet excluded);
    int ChoosePivot(const CVertexSet& candidates, const CVertexSet& excluded) const;
    void Report(const std::vector<int>& clique);

    const CHitMasks& m_masks;
    const std::vector<std::vector<std::vector<std::int32_t>>>& m_pairOffsets;
    int m_minSequences;

    // State of the hit being expanded.
    CSimHit m_hit;
    const std::function<bool()>* m_shouldAbort = nullptr;
    std::vector<CPlacement> m_placements;  // candidates first, then the excluded ones
    int m_candidateCount = 0;
    std::size_t m_words = 0;
    std::vector<std::uint64_t> m_adjacency;  // m_words per placement
    std::vector<CSimDiag> m_found;
    std::atomic<std::size_t>& m_heldBytes;
};
