#pragma once
// Phase one of the search: for a pair of encoded molecules, every diagonal on which an ungapped
// running score (reset to 0 whenever it falls below 0) reaches the cutoff.

#include <cstdint>
#include <functional>
#include <vector>

#include "search/ScoreGrid.h"

// Offsets d = (position in b) - (position in a), ascending, of the diagonals of (a, b) with a
// hit; scores are grid(residue of a, residue of b).
std::vector<std::int32_t> ScanPairScalar(const std::vector<std::uint8_t>& a,
                                         const std::vector<std::uint8_t>& b, const CScoreGrid& grid,
                                         int cutoff);

// Told how many hits a pair's scan has found so far, every few million residue pairs and once at
// the end; answers false to stop the scan.
using CScanProgress = std::function<bool(std::size_t hitsSoFar)>;

// The same scan, vectorised across diagonals: each molecule gets a query profile (per residue
// code, its scores against every position of the molecule as 16-bit values), and a row of the
// other molecule is scored against many positions at once. Scores and cutoffs that do not fit
// the 16-bit lanes fall back to the scalar scan. Scan() may be called from several threads.
class CPairScanner {
  public:
    CPairScanner(const CScoreGrid& grid, int cutoff,
                 const std::vector<const std::vector<std::uint8_t>*>& sequences);

    // The hit offsets of molecules a and b, as ScanPairScalar gives them. False, with the offsets
    // incomplete, when `progress` (if given) stopped the scan.
    bool Scan(int a, int b, std::vector<std::int32_t>& offsets,
              const CScanProgress& progress = {}) const;
    bool IsVectorised() const { return m_vectorised; }
    // Whether a scanner for this grid and cutoff builds query profiles (is vectorised).
    static bool UsesProfiles(const CScoreGrid& grid, int cutoff);

  private:
    bool ScanScalar(int a, int b, std::vector<std::int32_t>& offsets,
                    const CScanProgress& progress) const;
    bool ScanVectorised(int a, int b, std::vector<std::int32_t>& offsets,
                        const CScanProgress& progress) const;

    struct CProfile {
        std::size_t stride = 0;           // columns per code, padded to whole vectors
        std::vector<std::int16_t> cells;  // (grid size + 1) rows of `stride` columns
    };

    const CScoreGrid& m_grid;
    int m_cutoff;
    std::vector<const std::vector<std::uint8_t>*> m_sequences;
    bool m_vectorised;
    std::vector<CProfile> m_profiles;
};
