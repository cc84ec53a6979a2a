#pragma once
// A row's displayed text, one character per display column, with the residue position that
// each column shows: plain residues as stored, linked residues in upper case, '-' for gaps.

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "layout/SegmentRow.h"

class CDisplaySeq {
  public:
    CDisplaySeq() = default;
    // Built from the row's segments over `sequence` (the molecule's residues as stored). A gap
    // column records the last residue before it (-1 when the row starts with the gap).
    CDisplaySeq(const CSegmentRow& row, std::string_view sequence);

    const std::string& Text() const { return m_text; }
    const std::vector<std::int32_t>& Positions() const { return m_positions; }
    int Length() const { return static_cast<int>(m_text.size()); }

  private:
    std::string m_text;
    std::vector<std::int32_t> m_positions;
};
