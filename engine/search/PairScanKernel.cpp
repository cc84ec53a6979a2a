// Compiled once per instruction set that Highway targets; the best one is chosen at run time.
#if TB_HAVE_HWY
// Only AVX2 and the baseline are chosen at run time (see ChooseKernel), so only they are built.
#ifndef HWY_DISABLED_TARGETS
#define HWY_DISABLED_TARGETS \
    ((1LL << 7) | (1LL << 8) | (1LL << 11) | (1LL << 12))  // AVX-512, SSE4, SSSE3
#endif
#undef HWY_TARGET_INCLUDE
#define HWY_TARGET_INCLUDE "search/PairScanKernel.cpp"
#include <hwy/foreach_target.h>  // IWYU pragma: keep

#include <hwy/highway.h>

#include "search/PairScanKernel.h"

HWY_BEFORE_NAMESPACE();
namespace tb_search {
namespace HWY_NAMESPACE {
namespace hn = hwy::HWY_NAMESPACE;

void ScanProfileRowsImpl(const std::int16_t* profile, std::size_t stride, const std::uint8_t* rows,
                         std::size_t firstRow, std::size_t endRow, std::size_t rowCount,
                         std::size_t colCount, std::int16_t cutoff, std::int16_t* state,
                         std::uint8_t* hitByDiagonal) {
    const hn::ScalableTag<std::int16_t> d;
    const std::size_t lanes = hn::Lanes(d);
    const auto zero = hn::Zero(d);
    const auto hit = hn::Set(d, kProfileHitState);
    const auto belowCutoff = hn::Set(d, static_cast<std::int16_t>(cutoff - 1));
    if (firstRow == 0) {
        for (std::size_t c = 0; c <= stride; ++c)
            state[c] = 0;
    }
    for (std::size_t r = firstRow; r < endRow; ++r) {
        const std::int16_t* scores = profile + rows[r] * stride;
        // Descending, so each vector reads the previous row's values before they are replaced.
        for (std::size_t c = stride; c >= lanes;) {
            c -= lanes;
            const auto sum = hn::SaturatedAdd(hn::LoadU(d, state + c), hn::LoadU(d, scores + c));
            const auto kept = hn::Max(sum, zero);
            hn::StoreU(hn::IfThenElse(hn::Gt(sum, belowCutoff), hit, kept), d, state + c + 1);
        }
        // The diagonal ending in the last column of this row.
        if (state[colCount] == kProfileHitState)
            hitByDiagonal[colCount - 1 - r + rowCount - 1] = 1;
    }
    if (endRow < rowCount)
        return;
    // The diagonals ending in the last row.
    for (std::size_t c = 0; c < colCount; ++c) {
        if (state[c + 1] == kProfileHitState)
            hitByDiagonal[c] = 1;
    }
}

}  // namespace HWY_NAMESPACE
}  // namespace tb_search
HWY_AFTER_NAMESPACE();

#if HWY_ONCE
namespace {

using CKernel = decltype(&tb_search::HWY_STATIC_DISPATCH(ScanProfileRowsImpl));

// The widest instruction set this processor runs. Chosen here rather than through Highway's
// run-time dispatch, which would load its shared library (and its start-up cost) with every
// program of the project.
CKernel ChooseKernel() {
#if (HWY_TARGETS & HWY_AVX2) && HWY_ARCH_X86
    __builtin_cpu_init();
    if (__builtin_cpu_supports("avx2") && __builtin_cpu_supports("bmi2") &&
        __builtin_cpu_supports("fma")) {
        return &tb_search::N_AVX2::ScanProfileRowsImpl;
    }
#endif
    return &tb_search::HWY_STATIC_DISPATCH(ScanProfileRowsImpl);
}

}  // namespace

void ScanProfileRows(const std::int16_t* profile, std::size_t stride, const std::uint8_t* rows,
                     std::size_t firstRow, std::size_t endRow, std::size_t rowCount,
                     std::size_t colCount, std::int16_t cutoff, std::int16_t* state,
                     std::uint8_t* hitByDiagonal) {
    static const CKernel kernel = ChooseKernel();
    kernel(profile, stride, rows, firstRow, endRow, rowCount, colCount, cutoff, state,
           hitByDiagonal);
}
#endif
#endif  // TB_HAVE_HWY
