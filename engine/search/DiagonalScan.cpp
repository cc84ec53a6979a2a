#include "search/DiagonalScan.h"

#include <algorithm>
#include <bit>
#include <stdexcept>

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

// The group that a sweep from `root` collects: the members reachable from it through joins to
// members above it. Roots go up from member 0, and a member reached from a lower root collects
// nothing, so that is the root's connected set when the root is the lowest member of the set,
// else nothing; a lone member makes no group either.
std::uint64_t GroupRootedAt(int root, std::uint64_t component) {
    const bool lowest = std::countr_zero(component) == root;
    const bool several = (component & (component - 1)) != 0;
    return lowest && several ? component : 0;
}

// The members connected to `start` through joins (itself too); the search ends early once it
// reaches a member of `enough`.
std::uint64_t ReachedFrom(int start, const std::uint64_t* joins, std::uint64_t enough = 0) {
    std::uint64_t reached = std::uint64_t{1} << start;
    std::uint64_t frontier = reached;
    while (frontier != 0 && (reached & enough) == 0) {
        const int node = std::countr_zero(frontier);
        frontier &= frontier - 1;
        const std::uint64_t next = joins[node] & ~reached;
        reached |= next;
        frontier |= next;
    }
    return reached;
}

// Whether a and b are connected through joins.
bool Connected(int a, int b, const std::uint64_t* joins) {
    const std::uint64_t bitB = std::uint64_t{1} << b;
    return (ReachedFrom(a, joins, bitB) & bitB) != 0;
}

class CDiagonalScanner {
  public:
    CDiagonalScanner(const CSimDiag& diagonal, int longest, CPlacementJoins& joins)
        : m_diagonal(diagonal), m_joins(joins) {
        for (int t = 0; t < diagonal.MemberCount(); ++t) {
            m_firstColumn.push_back(longest - diagonal.offsets[t]);
        }
        m_pairScores.resize(diagonal.MemberCount() * diagonal.MemberCount());
    }

    // False when `shouldAbort` answered true.
    bool CollectJoins(const std::function<bool()>& shouldAbort) {
        const int count = m_diagonal.MemberCount();
        for (int a = 0; a < count; ++a) {
            for (int b = a + 1; b < count; ++b) {
                if (shouldAbort())
                    return false;
                const int offset = m_diagonal.offsets[b] - m_diagonal.offsets[a];
                const CPairJoin& join =
                    m_joins.Join(m_diagonal.members[a], m_diagonal.members[b], offset);
                m_pairScores[a * count + b] = {join.prefix.data(), m_firstColumn[a] + join.first};
                for (const CJoinedRun& run : join.runs) {
                    m_events.push_back({m_firstColumn[a] + run.begin, true, a, b});
                    m_events.push_back({m_firstColumn[a] + run.end, false, a, b});
                }
            }
        }
        SortEventsByColumn();
        return true;
    }

    void Sweep(int minSequences, std::vector<CBlockCandidate>& blocks) {
        const int count = m_diagonal.MemberCount();
        std::uint64_t joins[64] = {};
        std::uint64_t component[64];  // per member, the members it is connected to (itself too)
        for (int t = 0; t < count; ++t)
            component[t] = std::uint64_t{1} << t;
        std::uint64_t previous[64] = {};
        int runStart[64] = {};
        for (std::size_t e = 0; e < m_events.size();) {
            const int column = m_events[e].column;
            const std::size_t first = e;
            for (; e < m_events.size() && m_events[e].column == column; ++e) {
                const CJoinEvent& event = m_events[e];
                const std::uint64_t bitA = std::uint64_t{1} << event.a;
                const std::uint64_t bitB = std::uint64_t{1} << event.b;
                joins[event.a] = event.starts ? joins[event.a] | bitB : joins[event.a] & ~bitB;
                joins[event.b] = event.starts ? joins[event.b] | bitA : joins[event.b] & ~bitA;
            }
            if (!GroupsChanged(first, e, joins, component))
                continue;
            UpdateComponents(count, joins, component);
            for (int root = 0; root + 1 < count; ++root) {
                const std::uint64_t group = GroupRootedAt(root, component[root]);
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
    // Orders the events by column (a counting sort: columns are below 3L).
    void SortEventsByColumn() {
        int columns = 0;
        for (const CJoinEvent& event : m_events)
            columns = std::max(columns, event.column + 1);
        std::vector<int> firstOfColumn(columns + 1, 0);
        for (const CJoinEvent& event : m_events)
            ++firstOfColumn[event.column + 1];
        for (int c = 0; c < columns; ++c)
            firstOfColumn[c + 1] += firstOfColumn[c];
        std::vector<CJoinEvent> sorted(m_events.size());
        for (const CJoinEvent& event : m_events)
            sorted[firstOfColumn[event.column]++] = event;
        m_events = std::move(sorted);
    }

    // Whether the joins changed by events [first, end) split or merge any connected set: a new
    // join between two sets, or an ended join whose members are no longer connected.
    bool GroupsChanged(std::size_t first, std::size_t end, const std::uint64_t* joins,
                       const std::uint64_t* component) const {
        for (std::size_t e = first; e < end; ++e) {
            const CJoinEvent& event = m_events[e];
            const bool changed = event.starts ? !((component[event.a] >> event.b) & 1)
                                              : !Connected(event.a, event.b, joins);
            if (changed)
                return true;
        }
        return false;
    }

    static void UpdateComponents(int count, const std::uint64_t* joins, std::uint64_t* component) {
        std::uint64_t done = 0;
        for (int t = 0; t < count; ++t) {
            if ((done >> t) & 1)
                continue;
            const std::uint64_t reached = ReachedFrom(t, joins);
            for (std::uint64_t rest = reached; rest != 0; rest &= rest - 1)
                component[std::countr_zero(rest)] = reached;
            done |= reached;
        }
    }

    CBlockCandidate MakeBlock(std::uint64_t group, int firstColumn, int endColumn) const {
        CBlockCandidate block;
        block.width = endColumn - firstColumn;
        std::vector<int> members;
        const int size = std::popcount(group);
        members.reserve(size);
        block.molecules.reserve(size);
        block.starts.reserve(size);
        for (std::uint64_t rest = group; rest != 0; rest &= rest - 1) {
            const int t = std::countr_zero(rest);
            members.push_back(t);
            block.molecules.push_back(m_diagonal.members[t]);
            block.starts.push_back(firstColumn - m_firstColumn[t]);
        }
        const int count = m_diagonal.MemberCount();
        std::int64_t score = 0;
        for (std::size_t u = 0; u < members.size(); ++u) {
            for (std::size_t v = u + 1; v < members.size(); ++v) {
                const CPairScores& pair = m_pairScores[members[u] * count + members[v]];
                score += pair.prefix[endColumn - pair.firstColumn] -
                         pair.prefix[firstColumn - pair.firstColumn];
            }
        }
        block.score = static_cast<int>(score);
        return block;
    }

    const CSimDiag& m_diagonal;
    CPlacementJoins& m_joins;
    // The running scores of a member pair a < b (index a * count + b) by column: prefix[k] sums
    // the columns firstColumn .. firstColumn + k - 1.
    struct CPairScores {
        const std::int64_t* prefix = nullptr;
        int firstColumn = 0;
    };
    std::vector<CPairScores> m_pairScores;
    std::vector<int> m_firstColumn;
    std::vector<CJoinEvent> m_events;
};

}  // namespace

namespace {

// Residue p of `a` facing residue p + offset of `b`, over the positions of a whose partner exists.
CPairJoin JoinOf(const std::vector<std::uint8_t>& a, const std::vector<std::uint8_t>& b, int offset,
                 const CScoreGrid& grid, int cutoff) {
    CPairJoin join;
    join.first = std::max(0, -offset);
    const int length = static_cast<int>(a.size());
    const int end = std::max(join.first, std::min(length, static_cast<int>(b.size()) - offset));
    const std::uint8_t* residuesA = a.data() + join.first;
    const std::uint8_t* residuesB = b.data() + join.first + offset;
    join.prefix.assign(end - join.first + 1, 0);
    for (int k = 0; k < end - join.first; ++k)
        join.prefix[k + 1] = join.prefix[k] + grid(residuesA[k], residuesB[k]);
    if (end > join.first) {
        FindJoinedRuns(residuesA, residuesB, end - join.first, grid, cutoff, join.runs);
        for (CJoinedRun& run : join.runs) {
            run.begin += join.first;
            run.end += join.first;
        }
    }
    return join;
}

}  // namespace

CPlacementJoins::CPlacementJoins(
    const std::vector<const std::vector<std::uint8_t>*>& sequences, const CScoreGrid& grid,
    int cutoff, const std::vector<std::vector<std::vector<std::int32_t>>>& pairOffsets)
    : m_sequences(sequences), m_grid(grid), m_cutoff(cutoff), m_count(pairOffsets.size()) {
    for (std::size_t a = 0; a < m_count; ++a) {
        for (std::size_t b = 0; b < m_count; ++b) {
            m_firstOfPair.push_back(m_offsets.size());
            if (a < b)
                m_offsets.insert(m_offsets.end(), pairOffsets[a][b].begin(),
                                 pairOffsets[a][b].end());
        }
    }
    m_firstOfPair.push_back(m_offsets.size());
    m_joins.resize(m_offsets.size());
    m_states = std::make_unique<std::atomic<std::uint8_t>[]>(m_offsets.size());
}

std::size_t CPlacementJoins::IndexOf(int a, int b, int offset) const {
    const std::size_t pair = a * m_count + b;
    const auto first = m_offsets.begin() + m_firstOfPair[pair];
    const auto end = m_offsets.begin() + m_firstOfPair[pair + 1];
    const auto found = std::lower_bound(first, end, offset);
    if (found == end || *found != offset)
        throw std::logic_error("two members of a diagonal without a hit at their offset");
    return found - m_offsets.begin();
}

const CPairJoin& CPlacementJoins::Join(int a, int b, int offset) {
    const std::size_t index = IndexOf(a, b, offset);
    std::atomic<std::uint8_t>& state = m_states[index];
    for (;;) {
        std::uint8_t seen = state.load(std::memory_order_acquire);
        if (seen == kReady)
            return m_joins[index];
        if (seen == kWorking) {
            // Another worker is working it out (rarely: each takes a few microseconds).
            state.wait(seen, std::memory_order_acquire);
            continue;
        }
        if (!state.compare_exchange_strong(seen, kWorking))
            continue;
        try {
            m_joins[index] = JoinOf(*m_sequences[a], *m_sequences[b], offset, m_grid, m_cutoff);
        } catch (...) {
            // Out of memory: the slot is free again, so that no worker waits for it forever.
            state.store(kMissing, std::memory_order_release);
            state.notify_all();
            throw;
        }
        state.store(kReady, std::memory_order_release);
        state.notify_all();
        return m_joins[index];
    }
}

bool ScanDiagonal(const CSimDiag& diagonal, int longest, int minSequences, CPlacementJoins& joins,
                  const std::function<bool()>& shouldAbort, std::vector<CBlockCandidate>& blocks) {
    CDiagonalScanner scanner(diagonal, longest, joins);
    if (!scanner.CollectJoins(shouldAbort))
        return false;
    scanner.Sweep(minSequences, blocks);
    return true;
}
