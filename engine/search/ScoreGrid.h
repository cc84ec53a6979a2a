#pragma once
// A substitution table indexed directly by residue codes (1-based alphabet positions): the
// search kernels' view of a score matrix. Row and column 0 hold zeros.

#include <algorithm>
#include <cstdint>
#include <vector>

class CScoreGrid {
  public:
    CScoreGrid() = default;
    // `scores` holds size x size values row by row; code c names row and column c - 1.
    CScoreGrid(int size, const std::vector<int>& scores)
        : m_size(size), m_cells(static_cast<std::size_t>(size + 1) * (size + 1), 0) {
        for (int row = 0; row < size; ++row) {
            for (int col = 0; col < size; ++col) {
                m_cells[Index(row + 1, col + 1)] = scores[row * size + col];
            }
        }
    }

    int Size() const { return m_size; }
    int operator()(std::uint8_t row, std::uint8_t col) const { return m_cells[Index(row, col)]; }
    // Row `code`, indexed by column code.
    const int* Row(std::uint8_t code) const { return &m_cells[Index(code, 0)]; }
    int MaxScore() const { return m_cells.empty() ? 0 : *std::max_element(Begin(), m_cells.end()); }
    int MinScore() const { return m_cells.empty() ? 0 : *std::min_element(Begin(), m_cells.end()); }

  private:
    std::size_t Index(int row, int col) const {
        return static_cast<std::size_t>(row) * (m_size + 1) + col;
    }
    // The cells of the real rows (row 0 is padding); column 0 of each row is padding too but
    // holds 0, which never exceeds the bounds that matter to callers.
    std::vector<int>::const_iterator Begin() const { return m_cells.begin() + (m_size + 1); }

    int m_size = 0;
    std::vector<int> m_cells;
};
