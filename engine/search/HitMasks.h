#pragma once
// Which pairs of molecules have a hit at which offset: per molecule a, entry L + d holds bit b
// when molecules a and b have a hit at offset d = (position in b) - (position in a).

#include <cstdint>
#include <vector>

class CHitMasks {
  public:
    CHitMasks(int moleculeCount, int longest)
        : m_longest(longest),
          m_entries(2 * static_cast<std::size_t>(longest) + 1),
          m_masks(moleculeCount * m_entries, 0) {}

    int Longest() const { return m_longest; }
    // Records a hit of a and b at offset d in both directions.
    void Add(int a, int b, int d) {
        m_masks[Index(a, m_longest + d)] |= std::uint64_t{1} << b;
        m_masks[Index(b, m_longest - d)] |= std::uint64_t{1} << a;
    }
    // Entry p of molecule a; 0 outside 0..2L.
    std::uint64_t Entry(int a, long p) const {
        return p >= 0 && p < static_cast<long>(m_entries) ? m_masks[Index(a, p)] : 0;
    }
    bool Has(int a, int b, long d) const { return (Entry(a, m_longest + d) >> b) & 1; }

  private:
    std::size_t Index(int a, long p) const { return a * m_entries + p; }

    int m_longest;
    std::size_t m_entries;
    std::vector<std::uint64_t> m_masks;
};
