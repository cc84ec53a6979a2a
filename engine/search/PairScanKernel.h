#pragma once
// The vector kernel of the pair scan (dispatched to the best instruction set at run time).

#include <cstddef>
#include <cstdint>

// Scores `rowCount` rows (residue codes `rows`) against a query profile of `stride` columns per
// code, of which the first `colCount` are real. `state` has stride + 1 entries. On return,
// hitByDiagonal[d + rowCount - 1] is 1 for every diagonal d = column - row that reached
// `cutoff` (entries of diagonals without a hit are left alone).
void ScanProfileRows(const std::int16_t* profile, std::size_t stride, const std::uint8_t* rows,
                     std::size_t rowCount, std::size_t colCount, std::int16_t cutoff,
                     std::int16_t* state, std::uint8_t* hitByDiagonal);

// Lanes of the widest vector the kernel may use; profile strides are multiples of it.
inline constexpr std::size_t kProfileAlignment = 64;
// Largest magnitude of scores and cutoffs that the 16-bit lanes hold without overflow.
inline constexpr int kProfileScoreLimit = 8000;
