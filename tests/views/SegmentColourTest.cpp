#include <gtest/gtest.h>

#include <QPalette>
#include <random>

#include "layout/ColourRules.h"
#include "layout/ColourRuns.h"
#include "rows/SegmentWnd.h"

namespace {

// Block identifier i has colour 0x10101 * i (distinct, and xor-able), palette-relative for
// multiples of 3; block 99 does not exist.
std::uint32_t ColourOfBlock(int identifier) {
    if (identifier == 99)
        return kNoColour;
    const std::uint32_t palette = identifier % 3 == 0 ? 0x02000000u : 0;
    return palette | 0x010101u * static_cast<std::uint32_t>(identifier);
}

std::vector<CSimColorSegment> RandomRanges(std::mt19937& random, int length, int count) {
    std::uniform_int_distribution<int> start(-3, length);
    std::uniform_int_distribution<int> width(0, 12);
    std::uniform_int_distribution<int> block(1, 10);
    std::vector<CSimColorSegment> ranges;
    for (int i = 0; i < count; ++i) {
        const int identifier = block(random);
        ranges.emplace_back(identifier == 10 ? 99 : identifier, start(random), width(random));
    }
    return ranges;
}

TEST(ColourRuns, AgreeWithTheRangeByRangeRule) {
    std::mt19937 random(11);
    for (int trial = 0; trial < 300; ++trial) {
        const std::vector<CSimColorSegment> ranges = RandomRanges(random, 40, trial % 12);
        const CColourRuns runs(ranges, ColourOfBlock);
        for (int position = -2; position < 50; ++position) {
            ASSERT_EQ(runs.ColourAt(position), ColourAtPosition(position, ranges, ColourOfBlock))
                << "trial " << trial << " position " << position;
        }
    }
}

TEST(ColourRuns, OverlapIsNotFirstXorSecond) {
    const std::vector<CSimColorSegment> ranges = {{1, 0, 10}, {2, 5, 10}};
    const CColourRuns runs(ranges, ColourOfBlock);
    EXPECT_EQ(runs.ColourAt(2), 0x010101u);
    EXPECT_EQ(runs.ColourAt(7), (~0x010101u & 0xFFFFFFu) ^ 0x020202u);
    EXPECT_EQ(runs.ColourAt(12), 0x020202u);
    EXPECT_EQ(runs.ColourAt(15), kNoColour);
    EXPECT_TRUE(runs.IsBoundary(5));
    EXPECT_FALSE(runs.IsBoundary(6));
}

// A row of 30 residues whose residues 10..14 are linked at column 16 and 20..24 at column 30:
// gaps at columns 10..15 and 26..29.
CSegmentRow GappedRow() {
    CSegmentRow row(30);
    row.AddLinkedSegment(10, 5, 16);
    row.AddLinkedSegment(20, 5, 30);
    row.Complete();
    return row;
}

TEST(SegmentWnd, GapTakesTheColourOfARangeOnBothSides) {
    CSegmentColours colours;
    colours.blockColour = ColourOfBlock;
    CSegmentWnd row(QStringLiteral("A"), std::string(30, 'a'), colours);
    row.SetSegments(GappedRow());
    ASSERT_EQ(row.Text(), std::string(10, 'a') + std::string(6, '-') + "AAAAA" +
                              std::string(5, 'a') + std::string(4, '-') + "AAAAA" +
                              std::string(5, 'a'));
    // Block 3 holds residues 5..12: across the first gap. Block 4 ends at residue 19, where the
    // second gap begins.
    row.AddColourSegment({3, 5, 8});
    row.AddColourSegment({4, 15, 5});
    for (int column = 10; column < 16; ++column)
        EXPECT_EQ(row.BackgroundAt(column), 0x02030303u) << "gap inside block 3, column " << column;
    for (int column = 26; column < 30; ++column)
        EXPECT_EQ(row.BackgroundAt(column), kNoColour) << "gap at the edge of block 4";
    EXPECT_EQ(row.BackgroundAt(16), 0x02030303u) << "residue 10";
    EXPECT_EQ(row.BackgroundAt(19), kNoColour) << "residue 13";
    EXPECT_EQ(row.BackgroundAt(25), 0x040404u) << "residue 19";
    EXPECT_EQ(row.BackgroundAt(40), kNoColour) << "beyond the row";
    EXPECT_TRUE(row.RemoveColourSegment(3));
    EXPECT_FALSE(row.RemoveColourSegment(3));
    EXPECT_EQ(row.BackgroundAt(12), kNoColour);
}

TEST(SegmentWnd, BackgroundAgreesWithTheColumnRule) {
    std::mt19937 random(5);
    CSegmentColours colours;
    colours.blockColour = ColourOfBlock;
    for (int trial = 0; trial < 100; ++trial) {
        CSegmentWnd row(QStringLiteral("A"), std::string(30, 'k'), colours);
        row.SetSegments(GappedRow());
        for (const CSimColorSegment& range : RandomRanges(random, 30, trial % 8))
            row.AddColourSegment(range);
        for (int column = 0; column < row.ColumnCount(); ++column) {
            ASSERT_EQ(row.BackgroundAt(column),
                      ColourAtColumn(row.Segments(), column, row.ColourSegments(), ColourOfBlock))
                << "trial " << trial << " column " << column;
        }
    }
}

TEST(SegmentWnd, FreshRowIsOnePlainSegmentWithPositionNumbers) {
    CSegmentColours colours;
    CSegmentWnd row(QStringLiteral("A"), "mkv", colours);
    ASSERT_EQ(row.Segments().Segments().size(), 1u);
    EXPECT_EQ(row.Text(), "mkv");
    EXPECT_EQ(row.PositionNumber(0), 1);
    EXPECT_EQ(row.PositionNumber(2), 3);
    EXPECT_EQ(row.PositionNumber(3), -3) << "beyond the row: the last residue, negated";
    CSegmentWnd empty(QStringLiteral("B"), "", colours);
    EXPECT_EQ(empty.ColumnCount(), 0);
    EXPECT_EQ(empty.PositionNumber(0), 0);
}

}  // namespace
