#pragma once
// The layout of one molecule row: its segments in display order, built by placing the row's
// linked stretches at their link columns and filling the space before each with plain residues
// and gaps. Maps residue positions to display columns and back.

#include <vector>

#include "layout/SeqSegment.h"

class CSegmentRow {
  public:
    // An empty layout for a sequence of `sequenceLength` residues; Complete() alone makes it one
    // plain segment over the whole sequence.
    explicit CSegmentRow(int sequenceLength = 0);

    // Places residues position .. position + length - 1 at `column`: plain residues up to the
    // position, a gap up to the column, then the linked segment. Residues already placed and
    // residues beyond the sequence are left out; a column the row has already passed (links
    // that contradict each other) places the stretch right after the row's last segment.
    void AddLinkedSegment(int position, int length, int column);
    // Appends the residues after the last segment as one plain segment.
    void Complete();

    const std::vector<CSeqSegment>& Segments() const { return m_segments; }
    int SequenceLength() const { return m_sequenceLength; }
    // The column after the row's last segment.
    int EndColumn() const { return m_segments.empty() ? 0 : m_segments.back().EndColumn(); }

    // The segment that holds `column`, or null beyond the row.
    const CSeqSegment* SegmentAtColumn(int column) const;
    bool IsGapColumn(int column) const;
    // The column of residue `position`. Positions past the sequence continue after the row's
    // end (one column each); negative positions map to themselves.
    int PositionToColumn(int position) const;
    // The residue shown at `column`; a gap column gives the residue after the gap. Columns past
    // the row continue after the sequence's end; negative columns map to themselves.
    int ColumnToPosition(int column) const;
    // The number of residues (gap columns not counted) in columns [first, end).
    int ResiduesInColumns(int first, int end) const;
    // The number shown for a column: 1 + the residues before it; for a column at or beyond the
    // row's end, 1 - that number (0 or less, shown as a bullet and the absolute value).
    int PositionNumber(int column) const;

    // Trims the column range [start, end) at gaps: a start inside a gap moves to the gap's end,
    // an end whose last column is a gap moves to the gap's start. False, with the range left
    // as it was, when nothing is left of it.
    bool TrimAtGaps(int& start, int& end) const;

  private:
    // The position after the residues placed so far.
    int NextPosition() const;
    void Append(int position, int length, SegmentKind kind, int column);

    int m_sequenceLength;
    std::vector<CSeqSegment> m_segments;
};
