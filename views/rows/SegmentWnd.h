#pragma once
// A molecule row of the block panes: its residues laid out as segments (plain, linked, gaps)
// and the coloured ranges of the blocks marked in it.

#include <optional>
#include <string>
#include <vector>

#include "layout/ColourRules.h"
#include "layout/ColourRuns.h"
#include "layout/SegmentRow.h"
#include "rows/TextWnd.h"

// The colours a pane's molecule rows share: text colours of unlinked and linked residues
// (stored values) and the colour of a block by its identifier.
struct CSegmentColours {
    std::uint32_t textColour = kNoColour;
    std::uint32_t linkedTextColour = kNoColour;
    BlockColourLookup blockColour = [](int) { return kNoColour; };
};

class CSegmentWnd : public CTextWnd {
  public:
    // A row of one plain segment over the whole sequence. `colours` outlives the row.
    CSegmentWnd(QString name, std::string sequence, const CSegmentColours& colours);

    const std::string& Sequence() const { return m_sequence; }
    const CSegmentRow& Segments() const { return m_segments; }
    // Takes a layout of the row's residues (made with the links applied).
    void SetSegments(CSegmentRow segments);

    const std::vector<CSimColorSegment>& ColourSegments() const { return m_colourSegments; }
    void AddColourSegment(const CSimColorSegment& segment);
    // Removes the ranges of a block; false when there was none.
    bool RemoveColourSegment(int blockIdentifier);
    // Sets the range of a block (adding it when missing).
    void UpdateColourSegment(const CSimColorSegment& segment);
    void ClearColourSegments();
    // Block colours changed: the runs are worked out again when next needed.
    void RefreshColours() { m_runsStale = true; }

    // The stored background colour of a column: its residue's ranges, or for a gap the ranges
    // holding the residues on both sides; kNoColour beyond the row.
    std::uint32_t BackgroundAt(int column) const;
    std::optional<int> PositionNumber(int column) const override;

  protected:
    QColor TextColourAt(int column, const CRowPaintContext& context) const override;
    QColor BackgroundAt(int column, const CRowPaintContext& context) const override;

  private:
    // The colour runs, worked out once after every change of the ranges.
    const CColourRuns& Runs() const;

    std::string m_sequence;
    CSegmentRow m_segments;
    std::vector<std::int32_t> m_positions;
    std::vector<CSimColorSegment> m_colourSegments;
    mutable CColourRuns m_runs;
    mutable bool m_runsStale = false;
    const CSegmentColours& m_colours;
};
