#include "engine/reference/LiteralSearch.h"

#include <algorithm>

namespace literal {
namespace {

class CLiteralSearch {
  public:
    CLiteralSearch(const CTable& table, int cutoff, int minSequences,
                   const std::vector<std::vector<std::uint8_t>>& sequences)
        : m_table(table), m_cutoff(cutoff), m_min(minSequences), m_codes(sequences) {
        m_n = static_cast<int>(sequences.size());
        m_l = 0;
        for (const auto& s : sequences)
            m_l = std::max(m_l, static_cast<int>(s.size()));
        m_masks.assign(m_n, std::vector<std::uint64_t>(12 * static_cast<std::size_t>(m_l), 0));
    }

    CResult Run() {
        for (int i = 0; i < m_n; ++i) {
            for (int j = i + 1; j < m_n; ++j)
                ComparePair(i, j);
        }
        for (const CSimHit& hit : m_result.hits)
            Expand(CSimDiag(hit));
        for (const CSimDiag& diagonal : m_result.diagonals)
            ScanDiagonal(diagonal);
        return m_result;
    }

  private:
    int Len(int molecule) const { return static_cast<int>(m_codes[molecule].size()); }

    void ComparePair(int i, int j) {
        const int li = Len(i);
        const int lj = Len(j);
        for (int d = 1 - li; d <= lj - 1; ++d) {
            const int si = std::max(0, -d);
            const int sj = si + d;
            const int n = std::min(li - si, lj - sj);
            int s = 0;
            for (int k = 0; k < n; ++k) {
                s += m_table(m_codes[i][si + k], m_codes[j][sj + k]);
                if (s >= m_cutoff) {
                    m_result.hits.push_back({i, j, d});
                    m_masks[i][m_l + d] |= std::uint64_t{1} << j;
                    m_masks[j][m_l - d] |= std::uint64_t{1} << i;
                    break;
                }
                if (s < 0)
                    s = 0;
            }
        }
    }

    // Whether molecule k fits every member of d with entry p of the first member.
    bool Fits(const CSimDiag& d, int k, int p) const {
        if (!((m_masks[d.members[0]][p] >> k) & 1))
            return false;
        for (int t = 1; t < d.MemberCount(); ++t) {
            const int q = p - d.offsets[t];
            if (q < 0 || q >= 2 * m_l)
                return false;
            if (!((m_masks[d.members[t]][q] >> k) & 1))
                return false;
        }
        return true;
    }

    void Expand(const CSimDiag& d) {
        const int m = d.MemberCount();
        const int last = d.members[m - 1];
        bool maximal = true;
        for (int k = last + 1; k < m_n; ++k) {
            for (int p = 1; p <= 2 * m_l - 1; ++p) {
                if (!Fits(d, k, p))
                    continue;
                maximal = false;
                CSimDiag e = d;
                e.Append(k, p - m_l);
                Expand(e);
            }
        }
        if (maximal) {
            for (int k = 0; k < last && maximal; ++k) {
                if (std::find(d.members.begin(), d.members.end(), k) != d.members.end())
                    continue;
                for (int p = 1; p <= 2 * m_l - 1; ++p) {
                    if (Fits(d, k, p)) {
                        maximal = false;
                        break;
                    }
                }
            }
        }
        if (maximal && m >= m_min)
            m_result.diagonals.push_back(d);
    }

    void ScanDiagonal(const CSimDiag& d) {
        const int m = d.MemberCount();
        std::vector<int> a(m);
        std::vector<int> b(m);
        for (int t = 0; t < m; ++t) {
            a[t] = m_l - d.offsets[t];
            b[t] = a[t] + Len(d.members[t]);
        }
        // Pair tracks, in the masks reused as column masks: array t serves member t.
        for (int x = 0; x < m; ++x) {
            for (int y = x + 1; y < m; ++y) {
                for (int c = 0; c < 3 * m_l; ++c) {
                    m_masks[x][c] &= ~(std::uint64_t{1} << y);
                    m_masks[y][c] &= ~(std::uint64_t{1} << x);
                }
                const int lo = std::max(a[x], a[y]);
                const int hi = std::min(b[x], b[y]);
                const int n = hi - lo;
                int k = 0;
                int s = 0;
                int best = 0;
                int g = 0;
                int bestBegin = 0;
                int bestEnd = 0;
                while (k < n) {
                    s += m_table(m_codes[d.members[x]][lo - a[x] + k],
                                 m_codes[d.members[y]][lo - a[y] + k]);
                    if (s > best) {
                        best = s;
                        bestBegin = g;
                        bestEnd = k + 1;
                    }
                    if (s >= 0 && k != n - 1) {
                        ++k;
                        continue;
                    }
                    if (best >= m_cutoff) {
                        for (int c = lo + bestBegin; c < lo + bestEnd; ++c) {
                            m_masks[x][c] |= std::uint64_t{1} << y;
                            m_masks[y][c] |= std::uint64_t{1} << x;
                        }
                        k = bestEnd + 1;
                    } else {
                        k = k + 1;
                    }
                    g = k;
                    s = 0;
                    best = 0;
                    bestBegin = bestEnd = g;
                }
            }
        }
        // Column sweep.
        std::vector<std::uint64_t> prev(m, 0);
        std::vector<int> runStart(m, 0);
        for (int x = 0; x < 3 * m_l; ++x) {
            std::vector<bool> visited(m, false);
            for (int root = 0; root <= m - 2; ++root) {
                std::uint64_t cur = 0;
                if (!visited[root])
                    Visit(root, root, x, visited, cur);
                if (cur == prev[root])
                    continue;
                if (prev[root] != 0) {
                    CBlock block;
                    for (int t = 0; t < m; ++t) {
                        if ((prev[root] >> t) & 1) {
                            block.molecules.push_back(d.members[t]);
                            block.starts.push_back(runStart[root] - a[t]);
                        }
                    }
                    block.width = x - runStart[root];
                    if (static_cast<int>(block.molecules.size()) >= m_min && block.width >= 2) {
                        MakeBlock(block);
                    }
                }
                if (cur != 0)
                    runStart[root] = x;
                prev[root] = cur;
            }
        }
    }

    void Visit(int node, int root, int x, std::vector<bool>& visited, std::uint64_t& set) {
        visited[node] = true;
        set |= std::uint64_t{1} << node;
        for (int t = root + 1; t < static_cast<int>(visited.size()); ++t) {
            if (((m_masks[node][x] >> t) & 1) && !visited[t])
                Visit(t, root, x, visited, set);
        }
    }

    void MakeBlock(CBlock block) {
        const int count = static_cast<int>(block.molecules.size());
        for (int c = 0; c < block.width; ++c) {
            for (int u = 0; u < count; ++u) {
                for (int v = u + 1; v < count; ++v) {
                    block.score += m_table(m_codes[block.molecules[u]][block.starts[u] + c],
                                           m_codes[block.molecules[v]][block.starts[v] + c]);
                }
            }
        }
        auto& blocks = m_result.blocks;
        block.made = static_cast<int>(blocks.size());
        auto greater = [&](const CBlock& other) {
            const auto mine = static_cast<std::int16_t>(block.molecules.size());
            const auto theirs = static_cast<std::int16_t>(other.molecules.size());
            return mine > theirs || (mine == theirs && block.score > other.score);
        };
        blocks.insert(std::find_if(blocks.begin(), blocks.end(), greater), block);
    }

    const CTable& m_table;
    int m_cutoff;
    int m_min;
    const std::vector<std::vector<std::uint8_t>>& m_codes;
    int m_n = 0;
    int m_l = 0;
    std::vector<std::vector<std::uint64_t>> m_masks;
    CResult m_result;
};

// Adds, over every choice of indices from `first` on, the products of `left` more lengths.
double NestedSum(std::span<const double> lengths, int first, int left, double product) {
    if (left == 0)
        return product;
    double sum = 0.0;
    const int count = static_cast<int>(lengths.size());
    for (int k = first; k <= count - left; ++k) {
        sum += NestedSum(lengths, k + 1, left - 1, product * lengths[k]);
    }
    return sum;
}

}  // namespace

CResult Search(const CTable& table, int cutoff, int minSequences,
               const std::vector<std::vector<std::uint8_t>>& sequences) {
    return CLiteralSearch(table, cutoff, minSequences, sequences).Run();
}

std::vector<int> ComparePair(const CTable& table, int cutoff, const std::vector<std::uint8_t>& a,
                             const std::vector<std::uint8_t>& b) {
    CResult result = Search(table, cutoff, 3, {a, b});
    std::vector<int> offsets;
    for (const CSimHit& hit : result.hits)
        offsets.push_back(hit.offset);
    return offsets;
}

double SearchSpace(std::span<const double> lengths, int n) {
    return NestedSum(lengths, 0, n, 1.0);
}

}  // namespace literal
