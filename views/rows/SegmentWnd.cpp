#include "rows/SegmentWnd.h"

#include <QPalette>
#include <algorithm>

#include "StoredColour.h"
#include "layout/DisplaySeq.h"

CSegmentWnd::CSegmentWnd(QString name, std::string sequence, const CSegmentColours& colours)
    : CTextWnd(std::move(name)), m_sequence(std::move(sequence)), m_colours(colours) {
    CSegmentRow plain(static_cast<int>(m_sequence.size()));
    plain.Complete();
    SetSegments(std::move(plain));
    SetSelectable(true);
}

void CSegmentWnd::SetSegments(CSegmentRow segments) {
    m_segments = std::move(segments);
    CDisplaySeq display(m_segments, m_sequence);
    m_positions = display.Positions();
    SetText(display.Text());
}

void CSegmentWnd::AddColourSegment(const CSimColorSegment& segment) {
    m_colourSegments.push_back(segment);
    RefreshColours();
}

bool CSegmentWnd::RemoveColourSegment(int blockIdentifier) {
    const auto removed = std::erase_if(m_colourSegments, [blockIdentifier](const auto& s) {
        return s.BlockIdentifier() == blockIdentifier;
    });
    if (removed > 0)
        RefreshColours();
    return removed > 0;
}

void CSegmentWnd::UpdateColourSegment(const CSimColorSegment& segment) {
    auto it = std::find_if(m_colourSegments.begin(), m_colourSegments.end(),
                           [&segment](const CSimColorSegment& s) {
                               return s.BlockIdentifier() == segment.BlockIdentifier();
                           });
    if (it == m_colourSegments.end())
        m_colourSegments.push_back(segment);
    else
        *it = segment;
    RefreshColours();
}

void CSegmentWnd::ClearColourSegments() {
    m_colourSegments.clear();
    RefreshColours();
}

const CColourRuns& CSegmentWnd::Runs() const {
    if (m_runsStale) {
        m_runs = CColourRuns(m_colourSegments, m_colours.blockColour);
        m_runsStale = false;
    }
    return m_runs;
}

std::uint32_t CSegmentWnd::BackgroundAt(int column) const {
    if (column < 0 || column >= ColumnCount())
        return kNoColour;
    const CColourRuns& runs = Runs();
    if (CharAt(column) != '-')
        return runs.ColourAt(m_positions[column]);
    // A gap column records the residue before it.
    const int after = m_positions[column] + 1;
    if (after <= 0)
        return kNoColour;
    if (!runs.IsBoundary(after))
        return runs.ColourAt(after);
    return ColourAtColumn(m_segments, column, m_colourSegments, m_colours.blockColour);
}

std::optional<int> CSegmentWnd::PositionNumber(int column) const {
    return m_segments.PositionNumber(column);
}

QColor CSegmentWnd::TextColourAt(int column, const CRowPaintContext& context) const {
    const std::uint32_t text =
        TextColourOf(CharAt(column), m_colours.textColour, m_colours.linkedTextColour);
    return StoredColour(text, context.palette->color(QPalette::Text));
}

QColor CSegmentWnd::BackgroundAt(int column, const CRowPaintContext& context) const {
    return StoredColour(BackgroundAt(column), context.emptyBackground);
}
