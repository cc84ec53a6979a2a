#pragma once
// Whether a block's score is higher than chance gives for that many sequences of those lengths:
// Karlin-Altschul statistics with the constants of the matrix's statistics table.

#include <span>

#include "SimBlock.h"

class CScoreMatrix;
class CSimBlockSet;

enum SignificanceState { kNotSignificant = 0, kNotEvaluated = 1, kSignificant = 2 };

struct CBlockSignificance {
    int state = kNotEvaluated;
    double p = 1.0;  // 1.0 whenever the state is kNotEvaluated
};

// The significance of `block`'s layout within `blockSet` (null: not evaluated). The search space
// is the n-th elementary symmetric sum of the lengths of the set's molecules, n being the
// layout's sequence count; constants are those of min(n, 16) sequences.
CBlockSignificance EvaluateBlockSignificance(const CSimBlock& block, const CSimBlockSet* blockSet,
                                             const CScoreMatrix& matrix, double expectationLimit,
                                             CSimBlock::Layout layout);

// The sum over every choice of n different lengths of their product.
double ElementarySymmetricSum(std::span<const double> lengths, int n);
