// Compiled once per instruction set that Highway targets; the best one is chosen at run time.
#if TB_HAVE_HWY
#undef HWY_TARGET_INCLUDE
#define HWY_TARGET_INCLUDE "search/PairScanKernel.cpp"
#include <hwy/foreach_target.h>  // IWYU pragma: keep

#include <hwy/highway.h>

#include "search/PairScanKernel.h"

HWY_BEFORE_NAMESPACE();
namespace tb_search {
namespace HWY_NAMESPACE {
namespace hn = hwy::HWY_NAMESPACE;

// state[c + 1] is the running score of the diagonal through column c after the current row;
// a diagonal that has reached the cutoff holds kHit, which stays at or above the cutoff
// whatever is added (scores are bounded by kProfileScoreLimit).
constexpr std::int16_t kHit = 0x7FFF;

void ScanProfileRowsImpl(const std::int16_t* profile, std::size_t stride, const std::uint8_t* rows,
                         std::size_t rowCount, std::size_t colCount, std::int16_t cutoff,
                         std::int16_t* state, std::uint8_t* hitByDiagonal) {
    const hn::ScalableTag<std::int16_t> d;
    const std::size_t lanes = hn::Lanes(d);
    const auto zero = hn::Zero(d);
    const auto hit = hn::Set(d, kHit);
    const auto belowCutoff = hn::Set(d, static_cast<std::int16_t>(cutoff - 1));
    for (std::size_t c = 0; c <= stride; ++c)
        state[c] = 0;
    for (std::size_t r = 0; r < rowCount; ++r) {
        const std::int16_t* scores = profile + rows[r] * stride;
        // Descending, so each vector reads the previous row's values before they are replaced.
        for (std::size_t c = stride; c >= lanes;) {
            c -= lanes;
            const auto sum = hn::SaturatedAdd(hn::LoadU(d, state + c), hn::LoadU(d, scores + c));
            const auto kept = hn::Max(sum, zero);
            hn::StoreU(hn::IfThenElse(hn::Gt(sum, belowCutoff), hit, kept), d, state + c + 1);
        }
        // The diagonal ending in the last column of this row.
        if (state[colCount] == kHit)
            hitByDiagonal[colCount - 1 - r + rowCount - 1] = 1;
    }
    // The diagonals ending in the last row.
    for (std::size_t c = 0; c < colCount; ++c) {
        if (state[c + 1] == kHit)
            hitByDiagonal[c] = 1;
    }
}

}  // namespace HWY_NAMESPACE
}  // namespace tb_search
HWY_AFTER_NAMESPACE();

#if HWY_ONCE
namespace tb_search {
HWY_EXPORT(ScanProfileRowsImpl);
}  // namespace tb_search

void ScanProfileRows(const std::int16_t* profile, std::size_t stride, const std::uint8_t* rows,
                     std::size_t rowCount, std::size_t colCount, std::int16_t cutoff,
                     std::int16_t* state, std::uint8_t* hitByDiagonal) {
    HWY_DYNAMIC_DISPATCH(tb_search::ScanProfileRowsImpl)
    (profile, stride, rows, rowCount, colCount, cutoff, state, hitByDiagonal);
}
#endif
#endif  // TB_HAVE_HWY
