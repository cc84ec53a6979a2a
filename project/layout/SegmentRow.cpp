#include "layout/SegmentRow.h"

#include <algorithm>

CSegmentRow::CSegmentRow(int sequenceLength) : m_sequenceLength(std::max(sequenceLength, 0)) {}

int CSegmentRow::NextPosition() const {
    if (m_segments.empty())
        return 0;
    const CSeqSegment& last = m_segments.back();
    return last.IsGap() ? last.position : last.position + last.length;
}

void CSegmentRow::Append(int position, int length, SegmentKind kind, int column) {
    m_segments.push_back({column, position, length, kind});
}

void CSegmentRow::AddLinkedSegment(int position, int length, int column) {
    const int next = NextPosition();
    if (position < next) {
        const int placed = next - position;
        position += placed;
        length -= placed;
        column += placed;
    }
    length = std::min(length, m_sequenceLength - position);
    if (length <= 0)
        return;
    if (position > next)
        Append(next, position - next, kPlainSegment, EndColumn());
    const int end = EndColumn();
    if (column > end)
        Append(position, column - end, kGapSegment, end);
    Append(position, length, kLinkedSegment, EndColumn());
}

void CSegmentRow::Complete() {
    const int next = NextPosition();
    if (next < m_sequenceLength)
        Append(next, m_sequenceLength - next, kPlainSegment, EndColumn());
}

const CSeqSegment* CSegmentRow::SegmentAtColumn(int column) const {
    auto it = std::upper_bound(m_segments.begin(), m_segments.end(), column,
                               [](int c, const CSeqSegment& s) { return c < s.column; });
    if (it == m_segments.begin())
        return nullptr;
    --it;
    return it->HasColumn(column) ? &*it : nullptr;
}

bool CSegmentRow::IsGapColumn(int column) const {
    const CSeqSegment* segment = SegmentAtColumn(column);
    return segment && segment->IsGap();
}

int CSegmentRow::PositionToColumn(int position) const {
    if (position < 0)
        return position;
    // Positions never decrease along the row; a gap carries the position of the residue after it.
    auto it = std::upper_bound(m_segments.begin(), m_segments.end(), position,
                               [](int p, const CSeqSegment& s) { return p < s.position; });
    while (it != m_segments.begin()) {
        --it;
        if (it->IsGap())
            continue;
        if (it->HasPosition(position))
            return it->column + (position - it->position);
        break;
    }
    return EndColumn() + (position - NextPosition());
}

int CSegmentRow::ColumnToPosition(int column) const {
    if (column < 0)
        return column;
    const CSeqSegment* segment = SegmentAtColumn(column);
    if (!segment)
        return NextPosition() + (column - EndColumn());
    return segment->IsGap() ? segment->position : segment->position + (column - segment->column);
}

int CSegmentRow::ResiduesInColumns(int first, int end) const {
    auto residuesBefore = [this](int column) {
        if (column <= 0)
            return 0;
        return column >= EndColumn() ? NextPosition() : ColumnToPosition(column);
    };
    return end <= first ? 0 : residuesBefore(end) - residuesBefore(first);
}

int CSegmentRow::PositionNumber(int column) const {
    if (column >= EndColumn())
        return -NextPosition();
    return 1 + ResiduesInColumns(0, column);
}

bool CSegmentRow::TrimAtGaps(int& start, int& end) const {
    int first = start;
    int last = end;
    if (const CSeqSegment* gap = SegmentAtColumn(first); gap && gap->IsGap()) {
        first = gap->EndColumn();
    }
    if (const CSeqSegment* gap = SegmentAtColumn(last - 1); gap && gap->IsGap()) {
        last = gap->column;
    }
    if (first >= last)
        return false;
    start = first;
    end = last;
    return true;
}
