#pragma once
// One piece of a molecule row's layout: a run of display columns that shows plain residues,
// linked residues or gaps.

#include <cstdint>

enum SegmentKind : std::int16_t { kGapSegment = 0, kPlainSegment = 1, kLinkedSegment = 2 };

struct CSeqSegment {
    std::int32_t column = 0;    // first display column
    std::int32_t position = 0;  // first residue (0-based); for a gap, the residue after it
    std::int32_t length = 0;    // number of columns
    std::int16_t kind = kPlainSegment;

    bool IsGap() const { return kind == kGapSegment; }
    int EndColumn() const { return column + length; }
    bool HasColumn(int c) const { return c >= column && c < column + length; }
    bool HasPosition(int p) const { return !IsGap() && p >= position && p < position + length; }
    bool operator==(const CSeqSegment&) const = default;
};
