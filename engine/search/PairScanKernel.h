#pragma once
// The vector kernel of the pair scan (dispatched to the best instruction set at run time).

#include <cstddef>
#include <cstdint>

// Scores rows firstRow .. endRow - 1 of `rowCount` rows (residue codes `rows`) against a query
// profile of `stride` columns per code, of which the first `colCount` are real; a long scan is
// made of calls over consecutive row ranges. `state` has stride + 1 entries and carries the
// running scores from one call to the next: state[c + 1] belongs to the diagonal through column
// c of the last row scored, and holds kProfileHitState once that diagonal reached `cutoff`. When
// the last row has been scored, hitByDiagonal[d + rowCount - 1] is 1 for every diagonal
// d = column - row that reached the cutoff (entries of diagonals without a hit are left alone).
void ScanProfileRows(const std::int16_t* profile, std::size_t stride, const std::uint8_t* rows,
                     std::size_t firstRow, std::size_t endRow, std::size_t rowCount,
                     std::size_t colCount, std::int16_t cutoff, std::int16_t* state,
                     std::uint8_t* hitByDiagonal);

// The running score of a diagonal that has reached the cutoff: it stays at or above the cutoff
// whatever is added (scores are bounded by kProfileScoreLimit).
inline constexpr std::int16_t kProfileHitState = 0x7FFF;

// Lanes of the widest vector the kernel may use; profile strides are multiples of it.
inline constexpr std::size_t kProfileAlignment = 64;
// Largest magnitude of scores and cutoffs that the 16-bit lanes hold without overflow.
inline constexpr int kProfileScoreLimit = 8000;
