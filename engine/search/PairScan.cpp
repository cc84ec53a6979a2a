#include "search/PairScan.h"

#include <algorithm>

#include "search/PairScanKernel.h"

namespace {

// Residue pairs a scan scores between two calls of its progress.
constexpr std::size_t kPairsPerCheck = std::size_t{1} << 24;

// Appends the offsets of the diagonals firstOffset .. endOffset - 1 of (a, b) that have a hit.
void ScanDiagonalsScalar(const std::vector<std::uint8_t>& a, const std::vector<std::uint8_t>& b,
                         const CScoreGrid& grid, int cutoff, int firstOffset, int endOffset,
                         std::vector<std::int32_t>& offsets) {
    const int lengthA = static_cast<int>(a.size());
    const int lengthB = static_cast<int>(b.size());
    for (int d = firstOffset; d < endOffset; ++d) {
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
}

}  // namespace

std::vector<std::int32_t> ScanPairScalar(const std::vector<std::uint8_t>& a,
                                         const std::vector<std::uint8_t>& b, const CScoreGrid& grid,
                                         int cutoff) {
    std::vector<std::int32_t> offsets;
    ScanDiagonalsScalar(a, b, grid, cutoff, 1 - static_cast<int>(a.size()),
                        static_cast<int>(b.size()), offsets);
    return offsets;
}

bool CPairScanner::UsesProfiles(const CScoreGrid& grid, int cutoff) {
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

CPairScanner::CPairScanner(const CScoreGrid& grid, int cutoff,
                           const std::vector<const std::vector<std::uint8_t>*>& sequences)
    : m_grid(grid),
      m_cutoff(cutoff),
      m_sequences(sequences),
      m_vectorised(UsesProfiles(grid, cutoff)) {
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

bool CPairScanner::Scan(int a, int b, std::vector<std::int32_t>& offsets,
                        const CScanProgress& progress) const {
    offsets.clear();
    const bool completed = m_vectorised ? ScanVectorised(a, b, offsets, progress)
                                        : ScanScalar(a, b, offsets, progress);
    return completed && (!progress || progress(offsets.size()));
}

bool CPairScanner::ScanScalar(int a, int b, std::vector<std::int32_t>& offsets,
                              const CScanProgress& progress) const {
    const auto& rows = *m_sequences[a];
    const auto& columns = *m_sequences[b];
    // Diagonals hold at most min(length a, length b) pairs each.
    const std::size_t longestDiagonal =
        std::max<std::size_t>(1, std::min(rows.size(), columns.size()));
    const int perCheck =
        static_cast<int>(std::max<std::size_t>(1, kPairsPerCheck / longestDiagonal));
    const int endOffset = static_cast<int>(columns.size());
    for (int first = 1 - static_cast<int>(rows.size()); first < endOffset;) {
        const int end = endOffset - first > perCheck ? first + perCheck : endOffset;
        ScanDiagonalsScalar(rows, columns, m_grid, m_cutoff, first, end, offsets);
        if (end < endOffset && progress && !progress(offsets.size()))
            return false;
        first = end;
    }
    return true;
}

namespace {

// The hits of a vector scan after some of its rows: the diagonals marked as ended with a hit, and
// those still running whose score reached the cutoff. The diagonal through the last column
// has just been marked if it has a hit, so it is not counted again.
std::size_t HitsSoFar(const std::vector<std::uint8_t>& hitByDiagonal,
                      const std::vector<std::int16_t>& state, std::size_t columns) {
    std::size_t hits = 0;
    for (std::uint8_t marked : hitByDiagonal)
        hits += marked;
    for (std::size_t c = 0; c + 1 < columns; ++c)
        hits += state[c + 1] == kProfileHitState;
    return hits;
}

}  // namespace

bool CPairScanner::ScanVectorised(int a, int b, std::vector<std::int32_t>& offsets,
                                  const CScanProgress& progress) const {
    const auto& rows = *m_sequences[a];
    const auto& columns = *m_sequences[b];
    if (rows.empty() || columns.empty())
        return true;
    const CProfile& profile = m_profiles[b];
    thread_local std::vector<std::int16_t> state;
    thread_local std::vector<std::uint8_t> hitByDiagonal;
    state.resize(profile.stride + 1);
    hitByDiagonal.assign(rows.size() + columns.size() - 1, 0);
    // Counting the hits costs a pass over both arrays; a check scores many times that.
    const std::size_t countCost = state.size() + hitByDiagonal.size();
    const std::size_t perCheck =
        std::max<std::size_t>(1, std::max(kPairsPerCheck, 16 * countCost) / profile.stride);
    for (std::size_t first = 0; first < rows.size();) {
        const std::size_t end = std::min(rows.size(), first + perCheck);
        ScanProfileRows(profile.cells.data(), profile.stride, rows.data(), first, end, rows.size(),
                        columns.size(), static_cast<std::int16_t>(m_cutoff), state.data(),
                        hitByDiagonal.data());
        if (end < rows.size() && progress &&
            !progress(HitsSoFar(hitByDiagonal, state, columns.size())))
            return false;
        first = end;
    }
    const int firstOffset = 1 - static_cast<int>(rows.size());
    for (std::size_t i = 0; i < hitByDiagonal.size(); ++i) {
        if (hitByDiagonal[i])
            offsets.push_back(firstOffset + static_cast<int>(i));
    }
    return true;
}
