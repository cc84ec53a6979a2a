#include "BlockSignificance.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "ScoreMatrix.h"
#include "SimBlockSet.h"

namespace {

// Constants beyond this many sequences are those of this many.
constexpr int kLargestTabulatedSequences = 16;

}  // namespace

double ElementarySymmetricSum(std::span<const double> lengths, int n) {
    if (n < 0 || n > static_cast<int>(lengths.size()))
        return 0.0;
    // sums[k] = the k-th elementary symmetric sum of the lengths taken so far.
    std::vector<double> sums(n + 1, 0.0);
    sums[0] = 1.0;
    for (double length : lengths) {
        for (int k = n; k >= 1; --k)
            sums[k] += length * sums[k - 1];
    }
    return sums[n];
}

CBlockSignificance EvaluateBlockSignificance(const CSimBlock& block, const CSimBlockSet* blockSet,
                                             const CScoreMatrix& matrix, double expectationLimit,
                                             CSimBlock::Layout layout) {
    CBlockSignificance result;
    const int n = block.SequenceCount(layout);
    if (!blockSet || n < 2)
        return result;
    double lambda = 0.0;
    double k = 0.0;
    if (!matrix.Statistics().Lookup(std::min(n, kLargestTabulatedSequences), lambda, k)) {
        return result;
    }
    std::vector<double> lengths;
    for (const auto& entry : blockSet->Molecules().items) {
        lengths.push_back(static_cast<double>(entry->Sequence().size()));
    }
    const double space = ElementarySymmetricSum(lengths, n);
    const double expected = k * space * std::exp(-lambda * block.Score(layout));
    // 1 - exp(-x), without losing small probabilities to rounding.
    result.p = -std::expm1(-expected);
    result.state = result.p < expectationLimit ? kSignificant : kNotSignificant;
    return result;
}
