#include "search/PairScan.h"

#include <algorithm>

#include "search/PairScanKernel.h"

std::vector<std::int32_t> ScanPairScalar(const std::vector<std::uint8_t>& a,
                                         const std::vector<std::uint8_t>& b, const CScoreGrid& grid,
                                         int cutoff) {
    std::vector<std::int32_t> offsets;
    const int lengthA = static_cast<int>(a.size());
    const int lengthB = static_cast<int>(b.size());
    for (int d = 1 - lengthA; d < lengthB; ++d) {
        const int startA = std::max(0, -d);
        const int n = std::min(lengthA - startA, lengthB - startA - d);
        const std::uint8_t* rowA = a.data() + startA;
        const std::uint8_t* rowB = b.data() + startA + d;
        long long sum = 0;
        for (int k = 0; k < n; ++k) {
            sum += grid(rowA[k], rowB[k]);
            if (sum >= cutoff) {
                offsets.push_back(d);
                break;
            }
            if (sum < 0)
                sum = 0;
        }
    }
    return offsets;
}

namespace {

bool FitsProfileLanes(const CScoreGrid& grid, int cutoff) {
#if TB_HAVE_HWY
    auto fits = [](long long value) {
        return value >= -kProfileScoreLimit && value <= kProfileScoreLimit;
    };
    return fits(grid.MinScore()) && fits(grid.MaxScore()) && fits(cutoff);
#else
    (void)grid;
    (void)cutoff;
    return false;
#endif
}

}  // namespace

CPairScanner::CPairScanner(const CScoreGrid& grid, int cutoff,
                           const std::vector<const std::vector<std::uint8_t>*>& sequences)
    : m_grid(grid),
      m_cutoff(cutoff),
      m_sequences(sequences),
      m_vectorised(FitsProfileLanes(grid, cutoff)) {
    if (!m_vectorised)
        return;
    const int codes = grid.Size() + 1;
    for (const auto* sequence : sequences) {
        CProfile profile;
        const std::size_t length = sequence->size();
        profile.stride = (length + kProfileAlignment - 1) / kProfileAlignment * kProfileAlignment;
        profile.cells.assign(codes * profile.stride, 0);
        for (int code = 1; code < codes; ++code) {
            std::int16_t* row = profile.cells.data() + code * profile.stride;
            const int* scores = grid.Row(static_cast<std::uint8_t>(code));
            for (std::size_t c = 0; c < length; ++c)
                row[c] = static_cast<std::int16_t>(scores[(*sequence)[c]]);
        }
        m_profiles.push_back(std::move(profile));
    }
}

void CPairScanner::Scan(int a, int b, std::vector<std::int32_t>& offsets) const {
    const auto& rows = *m_sequences[a];
    const auto& columns = *m_sequences[b];
    if (!m_vectorised) {
        offsets = ScanPairScalar(rows, columns, m_grid, m_cutoff);
        return;
    }
    offsets.clear();
    if (rows.empty() || columns.empty())
        return;
    const CProfile& profile = m_profiles[b];
    thread_local std::vector<std::int16_t> state;
    thread_local std::vector<std::uint8_t> hitByDiagonal;
    state.resize(profile.stride + 1);
    hitByDiagonal.assign(rows.size() + columns.size() - 1, 0);
    ScanProfileRows(profile.cells.data(), profile.stride, rows.data(), rows.size(), columns.size(),
                    static_cast<std::int16_t>(m_cutoff), state.data(), hitByDiagonal.data());
    const int firstOffset = 1 - static_cast<int>(rows.size());
    for (std::size_t i = 0; i < hitByDiagonal.size(); ++i) {
        if (hitByDiagonal[i])
            offsets.push_back(firstOffset + static_cast<int>(i));
    }
}
