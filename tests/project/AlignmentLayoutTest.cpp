#include <gtest/gtest.h>

#include <random>
#include <string>

#include "layout/AlignmentLayout.h"
#include "layout/ColourRules.h"
#include "layout/DisplaySeq.h"
#include "layout/SegmentRow.h"
#include "layout/Selection.h"

namespace {

// Residues 5..7 of a 12-residue row linked at column 10: plain 0..4, five gap columns, the
// linked residues at 10..12, then the plain rest at 13..16.
CSegmentRow GappedRow() {
    CSegmentRow row(12);
    row.AddLinkedSegment(5, 3, 10);
    row.Complete();
    return row;
}

TEST(SegmentRow, RowWithoutLinksIsOnePlainSegment) {
    CSegmentRow row(7);
    row.Complete();
    ASSERT_EQ(row.Segments().size(), 1u);
    EXPECT_EQ(row.Segments()[0], (CSeqSegment{0, 0, 7, kPlainSegment}));
    EXPECT_EQ(CDisplaySeq(row, "mkvlaat").Text(), "mkvlaat");
}

TEST(SegmentRow, LinkedSegmentIsPrecededByPlainResiduesAndAGap) {
    const CSegmentRow row = GappedRow();
    const std::vector<CSeqSegment> expected = {{0, 0, 5, kPlainSegment},
                                               {5, 5, 5, kGapSegment},
                                               {10, 5, 3, kLinkedSegment},
                                               {13, 8, 4, kPlainSegment}};
    EXPECT_EQ(row.Segments(), expected);
    const CDisplaySeq display(row, "abcdefghijkl");
    EXPECT_EQ(display.Text(), "abcde-----FGHijkl");
    const std::vector<std::int32_t> positions = {0, 1, 2, 3, 4, 4, 4,  4, 4,
                                                 4, 5, 6, 7, 8, 9, 10, 11};
    EXPECT_EQ(display.Positions(), positions);
}

TEST(SegmentRow, ColumnsAndPositionsMapBothWays) {
    const CSegmentRow row = GappedRow();
    const std::string text = CDisplaySeq(row, "abcdefghijkl").Text();
    // Walk the text: the n-th residue character is position n.
    int position = 0;
    for (int column = 0; column < static_cast<int>(text.size()); ++column) {
        if (text[column] == '-') {
            EXPECT_EQ(row.ColumnToPosition(column), position)
                << "a gap maps to the residue after it";
            EXPECT_EQ(row.PositionNumber(column), position + 1);
            continue;
        }
        EXPECT_EQ(row.PositionToColumn(position), column);
        EXPECT_EQ(row.ColumnToPosition(column), position);
        EXPECT_EQ(row.PositionNumber(column), position + 1);
        ++position;
    }
    // Past the end: columns and positions continue one for one; the number turns negative.
    EXPECT_EQ(row.PositionToColumn(12), 17);
    EXPECT_EQ(row.ColumnToPosition(19), 14);
    EXPECT_EQ(row.PositionNumber(17), -12);
    EXPECT_EQ(row.PositionNumber(40), -12);
    EXPECT_EQ(row.ResiduesInColumns(3, 12), 4);  // d e, gap, F G
    EXPECT_EQ(row.ResiduesInColumns(5, 10), 0);
    EXPECT_EQ(row.ResiduesInColumns(15, 30), 2);
}

TEST(SegmentRow, StretchesThatContradictTheRowAreClippedNotReordered) {
    CSegmentRow row(10);
    row.AddLinkedSegment(2, 4, 5);
    row.AddLinkedSegment(4, 4, 3);    // residues 4 and 5 already placed; column already passed
    row.AddLinkedSegment(20, 5, 30);  // beyond the sequence
    row.Complete();
    const std::string text = CDisplaySeq(row, "abcdefghij").Text();
    EXPECT_EQ(text, "ab---CDEFGHij");
}

TEST(SegmentRow, SelectionsAreTrimmedAtGaps) {
    const CSegmentRow row = GappedRow();
    auto trim = [&row](int start, int end) {
        const bool kept = row.TrimAtGaps(start, end);
        return kept ? std::to_string(start) + "-" + std::to_string(end) : std::string("cleared");
    };
    EXPECT_EQ(trim(7, 12), "10-12");  // starts inside the gap
    EXPECT_EQ(trim(2, 8), "2-5");     // ends inside the gap
    EXPECT_EQ(trim(2, 10), "2-5");    // last selected column is the gap's last
    EXPECT_EQ(trim(2, 14), "2-14");   // spans the gap: kept whole
    EXPECT_EQ(trim(6, 9), "cleared");
    EXPECT_EQ(trim(5, 10), "cleared");
}

TEST(ColourRules, OverlappingBlocksCombineByNotXor) {
    const std::vector<CSimColorSegment> segments = {{1, 0, 6}, {2, 4, 6}, {3, 5, 1}};
    auto colourOf = [](int id) -> std::uint32_t {
        return id == 1 ? 0x0000FFu : id == 2 ? 0x00FF00u : 0x123456u;
    };
    EXPECT_EQ(ColourAtPosition(2, segments, colourOf), 0x0000FFu);
    EXPECT_EQ(ColourAtPosition(4, segments, colourOf), (~0x0000FFu & 0xFFFFFFu) ^ 0x00FF00u);
    const std::uint32_t two = (~0x0000FFu & 0xFFFFFFu) ^ 0x00FF00u;
    EXPECT_EQ(ColourAtPosition(5, segments, colourOf), (~two & 0xFFFFFFu) ^ 0x123456u);
    EXPECT_EQ(ColourAtPosition(11, segments, colourOf), kNoColour);
    EXPECT_EQ(ColourAtPosition(-1, segments, colourOf), kNoColour);
}

TEST(ColourRules, GapTakesTheColourOfABlockOnBothSides) {
    const CSegmentRow row = GappedRow();  // gap at columns 5..9 between residues 4 and 5
    auto colourOf = [](int id) -> std::uint32_t { return id == 7 ? 0x02112233u : kNoColour; };
    const std::vector<CSimColorSegment> across = {{7, 3, 4}};
    const std::vector<CSimColorSegment> edge = {{7, 5, 3}};
    EXPECT_EQ(ColourAtColumn(row, 7, across, colourOf), 0x02112233u);
    EXPECT_EQ(ColourAtColumn(row, 7, edge, colourOf), kNoColour);
    EXPECT_EQ(ColourAtColumn(row, 10, edge, colourOf), 0x02112233u);
    EXPECT_EQ(ColourAtColumn(row, 40, across, colourOf), kNoColour);
    // A block no longer in the set gives no colour.
    const std::vector<CSimColorSegment> missing = {{9, 0, 3}};
    EXPECT_EQ(ColourAtColumn(row, 1, missing, colourOf), kNoColour);
}

TEST(ColourRules, TextColourDependsOnlyOnTheCharacter) {
    const std::uint32_t text = 0x000080u;
    const std::uint32_t linked = 0x008000u;
    EXPECT_EQ(TextColourOf('a', text, linked), text);
    EXPECT_EQ(TextColourOf('A', text, linked), linked);
    EXPECT_EQ(TextColourOf('-', text, linked), kNoColour);
    EXPECT_EQ(TextColourOf('a', kNoColour, kNoColour), kNoColour);
}

CAlignmentLayout TwoRowLayout() {
    CLinkList links;
    auto link = std::make_unique<CLink>(6);
    link->AddMolecule(0, 6, 4, 0);
    link->AddMolecule(1, 0, 4, 6);
    links.Add(std::move(link));
    return CAlignmentLayout(
        {{"first", "mkvlaatwwgh", 0}, {"second", "atwwpq", 1}, {"other", "mm", -1}}, links);
}

TEST(AlignmentLayout, RowsFollowTheLinks) {
    const CAlignmentLayout layout = TwoRowLayout();
    ASSERT_EQ(layout.RowCount(), 3);
    EXPECT_EQ(layout.DisplaySeqOf(0).Text(), "mkvlaaTWWGh");
    EXPECT_EQ(layout.DisplaySeqOf(1).Text(), "------ATWWpq");
    EXPECT_EQ(layout.DisplaySeqOf(2).Text(), "mm");
    EXPECT_EQ(layout.ColumnCount(), 12);
    EXPECT_EQ(layout.IndexOfRow("second"), 1);
    EXPECT_EQ(layout.IndexOfRow("Second"), -1);
    EXPECT_EQ(layout.RowOfEntry(1), 1);
    EXPECT_EQ(layout.RowOfEntry(2), -1);
    EXPECT_EQ(layout.TextInColumns(1, 4, 8), "--AT");
    EXPECT_EQ(layout.TextInColumns(2, 1, 9), "m");
}

TEST(AlignmentLayout, BlockRangesCoverGapsInsideTheBlock) {
    const CAlignmentLayout layout = TwoRowLayout();
    CSimBlock block;
    const std::vector<std::int32_t> members = {0, 1};
    const std::vector<std::int32_t> starts = {4, 0};
    block.Init(members, starts, 5, 0, 0);
    block.SetIncluded(1, false);
    std::vector<CBlockRowRange> ranges = BlockRowRanges(layout, block);
    ASSERT_EQ(ranges.size(), 1u);
    EXPECT_EQ(ranges[0].row, 0);
    EXPECT_EQ(ranges[0].start, 4);
    EXPECT_EQ(ranges[0].end, 9);
    ranges = BlockRowRanges(layout, block, CSimBlock::kOriginal);
    ASSERT_EQ(ranges.size(), 2u);
    // Residues 0..4 of the second row stand at columns 6..10.
    EXPECT_EQ(ranges[1].start, 6);
    EXPECT_EQ(ranges[1].end, 11);
}

TEST(AlignmentLayout, BlockRequestTakesTheFewestResidues) {
    const CAlignmentLayout layout = TwoRowLayout();
    // Columns 3..8: the first row has six residues, the second three gaps and three residues.
    const std::vector<ALN_BSEL_ENTRY> selection = {{"second", 9, 3}, {"first", 3, 9}};
    const std::optional<CBlockRequest> request = MakeBlockRequest(layout, selection);
    ASSERT_TRUE(request);
    EXPECT_EQ(request->width, 3);
    EXPECT_EQ(request->members, (std::vector<std::int32_t>{1, 0}));
    EXPECT_EQ(request->starts, (std::vector<std::int32_t>{0, 3}));
    const std::vector<ALN_BSEL_ENTRY> oneRow = {{"first", 3, 9}, {"other", 0, 2}};
    EXPECT_FALSE(MakeBlockRequest(layout, oneRow));
    const std::vector<ALN_BSEL_ENTRY> trimmed = TrimSelection(layout, selection);
    EXPECT_EQ(trimmed, (std::vector<ALN_BSEL_ENTRY>{{"second", 6, 9}, {"first", 3, 9}}));
}

}  // namespace
