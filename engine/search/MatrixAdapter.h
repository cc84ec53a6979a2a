#pragma once
// The search kernels' view of a CScoreMatrix.

#include "ScoreMatrix.h"
#include "search/ScoreGrid.h"

inline CScoreGrid GridOf(const CScoreMatrix& matrix) {
    return CScoreGrid(matrix.Size(), matrix.Scores());
}
