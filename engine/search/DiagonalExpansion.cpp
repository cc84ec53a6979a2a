#include "search/DiagonalExpansion.h"

#include <algorithm>
#include <bit>
#include <optional>

namespace {

bool IsEmpty(const std::vector<std::uint64_t>& set) {
    return std::all_of(set.begin(), set.end(), [](std::uint64_t word) { return word == 0; });
}

int CountOf(const std::vector<std::uint64_t>& set) {
    int count = 0;
    for (std::uint64_t word : set)
        count += std::popcount(word);
    return count;
}

// Calls visit(v) for every element of `set` in increasing order.
template <class Visit>
void ForEach(const std::vector<std::uint64_t>& set, Visit visit) {
    for (std::size_t w = 0; w < set.size(); ++w) {
        for (std::uint64_t word = set[w]; word != 0; word &= word - 1) {
            visit(static_cast<int>(w * 64 + std::countr_zero(word)));
        }
    }
}

// Whether a loop over placements asks whether to abort at step `step`: every few steps, each
// of which tests up to a few thousand placement pairs.
bool IsCheckDue(std::size_t step) {
    return step % 16 == 0;
}

// The order of the (member, offset) sequences of diagonals that grew from one hit.
bool ComesBefore(const CSimDiag& a, const CSimDiag& b) {
    const std::size_t common = std::min(a.members.size(), b.members.size());
    for (std::size_t t = 0; t < common; ++t) {
        if (a.members[t] != b.members[t])
            return a.members[t] < b.members[t];
        if (a.offsets[t] != b.offsets[t])
            return a.offsets[t] < b.offsets[t];
    }
    return a.members.size() < b.members.size();
}

}  // namespace

CDiagonalExpander::CDiagonalExpander(
    const CHitMasks& masks, const std::vector<std::vector<std::vector<std::int32_t>>>& pairOffsets,
    int minSequences, std::atomic<std::size_t>& heldBytes)
    : m_masks(masks),
      m_pairOffsets(pairOffsets),
      m_minSequences(minSequences),
      m_heldBytes(heldBytes) {}

bool CDiagonalExpander::Expand(const CSimHit& hit, const std::function<bool()>& shouldAbort,
                               std::vector<CSimDiag>& kept) {
    m_hit = hit;
    m_shouldAbort = &shouldAbort;
    m_found.clear();
    if (shouldAbort())
        return false;
    CollectPlacements(hit);
    if (m_candidateCount + 2 < m_minSequences)
        return true;
    const std::optional<bool> dominated = SomeExcludedJoinsEveryCandidate();
    if (!dominated)
        return false;
    if (*dominated) {
        // No diagonal of this hit can be kept; the search would only find that out slowly.
        return true;
    }
    // A family that matches everywhere gives a hit tens of thousands of placements, and the
    // table grows with their square: the budget sees it before it is allocated, while it is used.
    m_words = (m_placements.size() + 63) / 64;
    const std::size_t tableBytes = m_placements.size() * m_words * sizeof(std::uint64_t);
    m_heldBytes += tableBytes;
    struct CRelease {
        std::atomic<std::size_t>& heldBytes;
        std::size_t bytes;
        ~CRelease() { heldBytes -= bytes; }
    } release{m_heldBytes, tableBytes};
    if (shouldAbort() || !BuildAdjacency())
        return false;

    CVertexSet candidates(m_words, 0);
    CVertexSet excluded(m_words, 0);
    for (int v = 0; v < static_cast<int>(m_placements.size()); ++v) {
        (v < m_candidateCount ? candidates : excluded)[v / 64] |= std::uint64_t{1} << (v % 64);
    }
    std::vector<int> clique;
    if (!Search(clique, std::move(candidates), std::move(excluded)))
        return false;
    std::sort(m_found.begin(), m_found.end(), ComesBefore);
    kept.insert(kept.end(), m_found.begin(), m_found.end());
    return true;
}

void CDiagonalExpander::CollectPlacements(const CSimHit& hit) {
    m_placements.clear();
    std::vector<CPlacement> excluded;
    const int count = static_cast<int>(m_pairOffsets.size());
    for (int k = 0; k < count; ++k) {
        if (k == hit.first || k == hit.second)
            continue;
        // Offsets of k relative to the first member of the hit.
        const bool above = k > hit.first;
        const auto& offsets = above ? m_pairOffsets[hit.first][k] : m_pairOffsets[k][hit.first];
        for (std::int32_t stored : offsets) {
            const std::int32_t offset = above ? stored : -stored;
            if (!m_masks.Has(hit.second, k, static_cast<long>(offset) - hit.offset))
                continue;
            (k > hit.second ? m_placements : excluded).push_back({k, offset});
        }
    }
    m_candidateCount = static_cast<int>(m_placements.size());
    m_placements.insert(m_placements.end(), excluded.begin(), excluded.end());
}

std::size_t CDiagonalExpander::BytesOf(const CSimDiag& diagonal) {
    constexpr std::size_t kAllocationOverhead = 16;
    return sizeof(CSimDiag) + 2 * kAllocationOverhead +
           diagonal.members.size() * (sizeof(std::uint16_t) + sizeof(std::int32_t));
}

bool CDiagonalExpander::Joins(const CPlacement& a, const CPlacement& b) const {
    return a.molecule != b.molecule &&
           m_masks.Has(a.molecule, b.molecule, static_cast<long>(b.offset) - a.offset);
}

std::optional<bool> CDiagonalExpander::SomeExcludedJoinsEveryCandidate() const {
    const auto candidates = m_placements.begin() + m_candidateCount;
    for (auto excluded = candidates; excluded != m_placements.end(); ++excluded) {
        if (IsCheckDue(excluded - candidates) && (*m_shouldAbort)())
            return std::nullopt;
        if (std::all_of(m_placements.begin(), candidates,
                        [&](const CPlacement& candidate) { return Joins(*excluded, candidate); }))
            return true;
    }
    return false;
}

bool CDiagonalExpander::BuildAdjacency() {
    const std::size_t count = m_placements.size();
    m_adjacency.assign(count * m_words, 0);
    for (std::size_t u = 0; u < count; ++u) {
        if (IsCheckDue(u) && (*m_shouldAbort)())
            return false;
        for (std::size_t v = u + 1; v < count; ++v) {
            if (!Joins(m_placements[u], m_placements[v]))
                continue;
            m_adjacency[u * m_words + v / 64] |= std::uint64_t{1} << (v % 64);
            m_adjacency[v * m_words + u / 64] |= std::uint64_t{1} << (u % 64);
        }
    }
    return true;
}

bool CDiagonalExpander::Search(std::vector<int>& clique, CVertexSet candidates,
                               CVertexSet excluded) {
    if ((*m_shouldAbort)())
        return false;
    if (IsEmpty(candidates)) {
        if (IsEmpty(excluded))
            Report(clique);
        return true;
    }
    // Even taking every candidate would leave the diagonal too small.
    if (static_cast<int>(clique.size()) + 2 + CountOf(candidates) < m_minSequences)
        return true;

    const std::uint64_t* pivotNeighbours =
        &m_adjacency[ChoosePivot(candidates, excluded) * m_words];
    CVertexSet branches(m_words);
    for (std::size_t w = 0; w < m_words; ++w)
        branches[w] = candidates[w] & ~pivotNeighbours[w];

    bool ok = true;
    ForEach(branches, [&](int v) {
        if (!ok)
            return;
        const std::uint64_t* neighbours = &m_adjacency[v * m_words];
        CVertexSet nextCandidates(m_words);
        CVertexSet nextExcluded(m_words);
        for (std::size_t w = 0; w < m_words; ++w) {
            nextCandidates[w] = candidates[w] & neighbours[w];
            nextExcluded[w] = excluded[w] & neighbours[w];
        }
        clique.push_back(v);
        ok = Search(clique, std::move(nextCandidates), std::move(nextExcluded));
        clique.pop_back();
        candidates[v / 64] &= ~(std::uint64_t{1} << (v % 64));
        excluded[v / 64] |= std::uint64_t{1} << (v % 64);
    });
    return ok;
}

int CDiagonalExpander::ChoosePivot(const CVertexSet& candidates, const CVertexSet& excluded) const {
    int pivot = -1;
    int best = -1;
    auto consider = [&](int u) {
        const std::uint64_t* neighbours = &m_adjacency[u * m_words];
        int shared = 0;
        for (std::size_t w = 0; w < m_words; ++w)
            shared += std::popcount(candidates[w] & neighbours[w]);
        if (shared > best) {
            best = shared;
            pivot = u;
        }
    };
    ForEach(candidates, consider);
    ForEach(excluded, consider);
    return pivot;
}

void CDiagonalExpander::Report(const std::vector<int>& clique) {
    if (static_cast<int>(clique.size()) + 2 < m_minSequences)
        return;
    std::vector<CPlacement> others;
    for (int v : clique)
        others.push_back(m_placements[v]);
    std::sort(others.begin(), others.end(),
              [](const CPlacement& a, const CPlacement& b) { return a.molecule < b.molecule; });
    CSimDiag diagonal(m_hit);
    for (const CPlacement& placement : others)
        diagonal.Append(placement.molecule, placement.offset);
    m_heldBytes += BytesOf(diagonal);
    m_found.push_back(std::move(diagonal));
}
