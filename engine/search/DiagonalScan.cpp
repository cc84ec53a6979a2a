#include "search/DiagonalScan.h"

#include <algorithm>
#include <bit>

void FindJoinedRuns(const std::uint8_t* a, const std::uint8_t* b, int length,
                    const CScoreGrid& grid, int cutoff, std::vector<CJoinedRun>& runs) {
    runs.clear();
    int k = 0;
    while (k < length) {
        // One stretch from `begin`: it ends where the running sum falls below 0, or at the end.
        const int begin = k;
        long long sum = 0;
        long long best = 0;
        int bestEnd = begin;
        for (;; ++k) {
            sum += grid(a[k], b[k]);
            if (sum > best) {
                best = sum;
                bestEnd = k + 1;
            }
            if (sum < 0 || k == length - 1)
                break;
        }
        if (best >= cutoff) {
            if (bestEnd > begin)
                runs.push_back({begin, bestEnd});
            k = bestEnd + 1;
        } else {
            k = k + 1;
        }
    }
}

namespace {

struct CJoinEvent {
    int column;
    bool starts;  // a join starts at this column (else it ends here)
    int a;
    int b;
};

// The members reachable from `root` through joins to members above the root, or nothing when
// the root was reached from a lower member or has no join (a lone member makes no block).
std::uint64_t GroupOf(int root, const std::uint64_t* joins, std::uint64_t& visited) {
    if ((visited >> root) & 1)
        return 0;
    const std::uint64_t above = root + 1 < 64 ? ~std::uint64_t{0} << (root + 1) : 0;
    std::uint64_t group = std::uint64_t{1} << root;
    std::uint64_t frontier = group;
    visited |= group;
    while (frontier != 0) {
        const int node = std::countr_zero(frontier);
        frontier &= frontier - 1;
        const std::uint64_t next = joins[node] & above & ~visited;
        visited |= next;
        group |= next;
        frontier |= next;
    }
    return std::popcount(group) >= 2 ? group : 0;
}

class CDiagonalScanner {
  public:
    CDiagonalScanner(const CSimDiag& diagonal, int longest, CJoinedRunCache& joins)
        : m_diagonal(diagonal), m_joins(joins) {
        for (int t = 0; t < diagonal.MemberCount(); ++t) {
            m_firstColumn.push_back(longest - diagonal.offsets[t]);
        }
    }

    void CollectJoins() {
        const int count = m_diagonal.MemberCount();
        for (int a = 0; a < count; ++a) {
            for (int b = a + 1; b < count; ++b) {
                const int offset = m_diagonal.offsets[b] - m_diagonal.offsets[a];
                for (const CJoinedRun& run :
                     m_joins.Runs(m_diagonal.members[a], m_diagonal.members[b], offset)) {
                    m_events.push_back({m_firstColumn[a] + run.begin, true, a, b});
                    m_events.push_back({m_firstColumn[a] + run.end, false, a, b});
                }
            }
        }
        std::sort(m_events.begin(), m_events.end(), [](const CJoinEvent& x, const CJoinEvent& y) {
            return x.column != y.column ? x.column < y.column : x.starts < y.starts;
        });
    }

    void Sweep(int minSequences, std::vector<CBlockCandidate>& blocks) {
        const int count = m_diagonal.MemberCount();
        std::uint64_t joins[64] = {};
        std::uint64_t previous[64] = {};
        int runStart[64] = {};
        for (std::size_t e = 0; e < m_events.size();) {
            const int column = m_events[e].column;
            for (; e < m_events.size() && m_events[e].column == column; ++e) {
                const CJoinEvent& event = m_events[e];
                const std::uint64_t bitA = std::uint64_t{1} << event.a;
                const std::uint64_t bitB = std::uint64_t{1} << event.b;
                joins[event.a] = event.starts ? joins[event.a] | bitB : joins[event.a] & ~bitB;
                joins[event.b] = event.starts ? joins[event.b] | bitA : joins[event.b] & ~bitA;
            }
            std::uint64_t visited = 0;
            for (int root = 0; root + 1 < count; ++root) {
                const std::uint64_t group = GroupOf(root, joins, visited);
                if (group == previous[root])
                    continue;
                if (previous[root] != 0 && std::popcount(previous[root]) >= minSequences &&
                    column - runStart[root] >= 2) {
                    blocks.push_back(MakeBlock(previous[root], runStart[root], column));
                }
                if (group != 0)
                    runStart[root] = column;
                previous[root] = group;
            }
        }
    }

  private:
    const std::uint8_t* Residues(int t, int column) const {
        return m_joins.Residues(m_diagonal.members[t]) + (column - m_firstColumn[t]);
    }

    CBlockCandidate MakeBlock(std::uint64_t group, int firstColumn, int endColumn) const {
        CBlockCandidate block;
        block.width = endColumn - firstColumn;
        std::vector<const std::uint8_t*> rows;
        for (std::uint64_t rest = group; rest != 0; rest &= rest - 1) {
            const int t = std::countr_zero(rest);
            block.molecules.push_back(m_diagonal.members[t]);
            block.starts.push_back(firstColumn - m_firstColumn[t]);
            rows.push_back(Residues(t, firstColumn));
        }
        const CScoreGrid& grid = m_joins.Grid();
        long long score = 0;
        for (std::size_t u = 0; u < rows.size(); ++u) {
            for (std::size_t v = u + 1; v < rows.size(); ++v) {
                for (int c = 0; c < block.width; ++c)
                    score += grid(rows[u][c], rows[v][c]);
            }
        }
        block.score = static_cast<int>(score);
        return block;
    }

    const CSimDiag& m_diagonal;
    CJoinedRunCache& m_joins;
    std::vector<int> m_firstColumn;
    std::vector<CJoinEvent> m_events;
};

}  // namespace

const std::vector<CJoinedRun>& CJoinedRunCache::Runs(int a, int b, int offset) {
    const std::uint64_t key = (static_cast<std::uint64_t>(a) << 40) |
                              (static_cast<std::uint64_t>(b) << 34) |
                              static_cast<std::uint32_t>(offset);
    auto [entry, added] = m_runs.try_emplace(key);
    if (added) {
        // Positions of a whose partner in b exists.
        const int first = std::max(0, -offset);
        const int end = std::min(Length(a), Length(b) - offset);
        if (end > first) {
            FindJoinedRuns(Residues(a) + first, Residues(b) + first + offset, end - first, m_grid,
                           m_cutoff, entry->second);
            for (CJoinedRun& run : entry->second) {
                run.begin += first;
                run.end += first;
            }
        }
    }
    return entry->second;
}

void ScanDiagonal(const CSimDiag& diagonal, int longest, int minSequences, CJoinedRunCache& joins,
                  std::vector<CBlockCandidate>& blocks) {
    CDiagonalScanner scanner(diagonal, longest, joins);
    scanner.CollectJoins();
    scanner.Sweep(minSequences, blocks);
}
