#include <gtest/gtest.h>

#include <random>
#include <string>

#include "layout/RowGeometry.h"

namespace {

// 10 pixels per column, the sequence area starting at x = 100, column 20 first.
constexpr CColumnAxis kAxis{100, 10.0, 20, 50};

TEST(RowGeometry, ColumnsAndTheirLeftEdgesAgree) {
    for (int column = 20; column < 50; ++column) {
        const double left = ColumnLeft(kAxis, column);
        EXPECT_EQ(ColumnAtX(kAxis, left), column);
        EXPECT_EQ(ColumnAtX(kAxis, left + 9.99), column);
    }
    EXPECT_DOUBLE_EQ(ColumnLeft(kAxis, 20), 100);
    EXPECT_DOUBLE_EQ(ColumnLeft(kAxis, 18), 80) << "columns scrolled off lie left of the area";
}

TEST(RowGeometry, ColumnUnderPointIsClampedToTheColumns) {
    EXPECT_EQ(ColumnAtX(kAxis, 0), 10) << "left of the area: still counted from the first column";
    EXPECT_EQ(ColumnAtX(kAxis, -5000), 0);
    EXPECT_EQ(ColumnAtX(kAxis, 5000), 49);
    EXPECT_EQ(ColumnAtX({0, 0.0, 0, 50}, 30), -1) << "a scale of 0 hits nothing";
    EXPECT_EQ(ColumnAtX({0, 10.0, 0, 0}, 30), -1) << "no columns, nothing to hit";
    EXPECT_EQ(ColumnAtX({0, 0.37, 0, 1000}, 37), 100) << "fractional scales";
}

TEST(RowGeometry, CaretRoundsToTheNearerBoundary) {
    const double boundary = ColumnLeft(kAxis, 30);
    EXPECT_EQ(CaretColumnAtX(kAxis, boundary), 30);
    EXPECT_EQ(CaretColumnAtX(kAxis, boundary + 4.9), 30);
    EXPECT_EQ(CaretColumnAtX(kAxis, boundary + 5.0), 30) << "exactly half stays";
    EXPECT_EQ(CaretColumnAtX(kAxis, boundary + 5.1), 31) << "more than half goes on";
    EXPECT_EQ(CaretColumnAtX(kAxis, boundary - 4.9), 30);
    EXPECT_EQ(CaretColumnAtX(kAxis, boundary - 5.1), 29);
    EXPECT_EQ(CaretColumnAtX(kAxis, 1e6), 50) << "the caret may stand after the last column";
    EXPECT_EQ(CaretColumnAtX(kAxis, -1e6), 0);
    EXPECT_EQ(CaretColumnAtX({0, 0.0, 0, 5}, 3), -1);
}

TEST(RowGeometry, BandCoversColumnsUnderBothEdges) {
    EXPECT_EQ(BandColumns(3.2, 7.9, 20), (CColumnRange{3, 8}));
    EXPECT_EQ(BandColumns(7.9, 3.2, 20), (CColumnRange{3, 8})) << "dragged to the left";
    EXPECT_EQ(BandColumns(5.5, 5.6, 20), (CColumnRange{5, 6})) << "a click selects one column";
    EXPECT_EQ(BandColumns(-4, 100, 20), (CColumnRange{0, 20}));
    EXPECT_TRUE(BandColumns(1, 2, 0).IsEmpty());
}

TEST(RowGeometry, FitScaleIsCutToHundredthsNotRounded) {
    // 29 / 100 is 0.28999... in binary: a naive floor(100 * s) gives 0.28.
    EXPECT_DOUBLE_EQ(FitScale(29, 0, 100), 0.29);
    EXPECT_DOUBLE_EQ(FitScale(57, 0, 100), 0.57);
    EXPECT_DOUBLE_EQ(FitScale(2, 0, 3), 0.66) << "0.666... is cut, not rounded up";
    EXPECT_DOUBLE_EQ(FitScale(1004, 4, 3), 333.33);
    EXPECT_DOUBLE_EQ(FitScale(104, 4, 10), 10.0) << "the right margin is left out";
    EXPECT_EQ(FitScale(3, 4, 10), 0) << "never below 0";
    EXPECT_EQ(FitScale(500, 0, 0), 0);
    // Every cut scale is a whole number of hundredths no larger than the exact quotient.
    for (int width = 1; width < 400; width += 7) {
        for (int columns = 1; columns < 300; columns += 13) {
            const double scale = FitScale(width, 0, columns);
            const long hundredths = std::lround(scale * 100);
            EXPECT_LE(hundredths * columns, width * 100L);
            EXPECT_GT((hundredths + 1) * columns, width * 100L);
        }
    }
}

TEST(RowGeometry, VisibleAndPaintedColumns) {
    EXPECT_EQ(VisibleColumns(95, 10), 9);
    EXPECT_EQ(VisibleColumns(95, 0), 0);
    EXPECT_EQ(VisibleColumns(0, 10), 0);
    EXPECT_EQ(PaintedColumnEnd(kAxis, 95), 30) << "a partly shown column is painted";
    EXPECT_EQ(PaintedColumnEnd(kAxis, 100000), 50) << "never past the last column";
    EXPECT_EQ(PaintedColumnEnd({0, 0.0, 3, 50}, 100), 3) << "nothing at scale 0";
}

TEST(RowGeometry, ScrollingToShowAColumn) {
    // 40 visible columns of 200, first column 50.
    EXPECT_EQ(FirstColumnToShow(50, 50, 40, 200), 50) << "visible: no scrolling";
    EXPECT_EQ(FirstColumnToShow(89, 50, 40, 200), 50);
    EXPECT_EQ(FirstColumnToShow(90, 50, 40, 200), 85) << "shown 5 columns from the left";
    EXPECT_EQ(FirstColumnToShow(49, 50, 40, 200), 44);
    EXPECT_EQ(FirstColumnToShow(3, 50, 40, 200), 0) << "clamped at the start";
    EXPECT_EQ(FirstColumnToShow(199, 0, 40, 200), 160) << "clamped at the end";
    EXPECT_EQ(ClampFirstColumn(10, 5, 40), 0) << "all columns visible";
}

TEST(RowGeometry, SelectionEdgesWithinHalfAColumn) {
    const CColumnRange selection{25, 30};
    const double start = ColumnLeft(kAxis, 25);
    const double end = ColumnLeft(kAxis, 30);
    EXPECT_EQ(SelectionEdgeAt(kAxis, start + 4, selection), SelectionEdge::kStart);
    EXPECT_EQ(SelectionEdgeAt(kAxis, start - 4.9, selection), SelectionEdge::kStart);
    EXPECT_EQ(SelectionEdgeAt(kAxis, start + 5, selection), SelectionEdge::kNone)
        << "the middle of the first column";
    EXPECT_EQ(SelectionEdgeAt(kAxis, start + 6, selection), SelectionEdge::kNone);
    EXPECT_EQ(SelectionEdgeAt(kAxis, end - 3, selection), SelectionEdge::kEnd);
    EXPECT_EQ(SelectionEdgeAt(kAxis, end + 4.9, selection), SelectionEdge::kEnd);
    EXPECT_EQ(SelectionEdgeAt(kAxis, end + 6, selection), SelectionEdge::kNone);
    EXPECT_EQ(SelectionEdgeAt(kAxis, start, CColumnRange{}), SelectionEdge::kNone);
    // A one-column selection: the nearer edge wins.
    EXPECT_EQ(SelectionEdgeAt(kAxis, start + 6, {25, 26}), SelectionEdge::kEnd);
    EXPECT_EQ(SelectionEdgeAt(kAxis, start + 4, {25, 26}), SelectionEdge::kStart);
}

TEST(RowGeometry, NameArea) {
    EXPECT_EQ(NameAreaWidth(80, 500), 90);
    EXPECT_EQ(NameAreaWidth(80, 50), 50) << "never wider than the window";
    EXPECT_EQ(NameAreaWidth(80, 0), 0);
    EXPECT_EQ(ShortenName("HBA_HUMAN", 5), "HBA_H...");
    EXPECT_EQ(ShortenName("HBA_HUMAN", 9), "HBA_HUMAN");
    EXPECT_EQ(ShortenName("HBA_HUMAN", 0), "HBA_HUMAN");
    EXPECT_EQ(ShortenName("\u00e9t\u00e9 long", 2), "\u00e9t...") << "whole characters";
}

TEST(RowGeometry, ElidedNameIsTheLongestThatFits) {
    // 7 pixels per character, whatever it is.
    auto measure = [](std::string_view text) { return static_cast<int>(text.size()) * 7; };
    EXPECT_EQ(ElideName("MYG_HORSE", 63, measure), "MYG_HORSE");
    EXPECT_EQ(ElideName("MYG_HORSE", 62, measure), "MYG_H...") << "8 characters fit";
    EXPECT_EQ(ElideName("MYG_HORSE", 10, measure), "...");
    const std::string huge(10 * 1024, 'x');
    const std::string elided = ElideName(huge, 700, measure);
    EXPECT_EQ(elided, std::string(97, 'x') + "...");
    // Multi-byte characters are never cut in half.
    auto characters = [](std::string_view text) {
        int count = 0;
        for (char c : text)
            count += (static_cast<unsigned char>(c) & 0xC0) != 0x80;
        return count * 7;
    };
    EXPECT_EQ(ElideName("\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9", 35, characters), "\u00e9\u00e9...");
}

TEST(RowGeometry, PositionTextShowsABulletBeyondTheRow) {
    EXPECT_EQ(RowPositionText(1), "(1) ");
    EXPECT_EQ(RowPositionText(153), "(153) ");
    EXPECT_EQ(RowPositionText(-141), "(\u2022141) ") << "beyond residue 141, the last one";
    EXPECT_EQ(RowPositionText(0), "(\u20220) ") << "a row without residues";
    EXPECT_EQ(NumberAreaSample(5, 0), "(\u202299) ") << "never narrower than 99";
    EXPECT_EQ(NumberAreaSample(153, 2), "(\u20221550) ");
}

// The ruler steps as plainly stated: grow by one until labels fit, then round and grow again.
CRulerSteps LiteralRulerSteps(double scale, int width, int minimum, int base) {
    CRulerSteps steps{minimum, 1};
    while (scale > 0 && steps.label * scale < 2 * width)
        ++steps.label;
    steps.shortTick = static_cast<int>(std::floor(double(base) * steps.label / minimum + 0.5));
    while (steps.label % steps.shortTick != 0)
        ++steps.label;
    return steps;
}

TEST(RowGeometry, RulerSteps) {
    EXPECT_EQ(RulerSteps(10, 20).label, 10);
    EXPECT_EQ(RulerSteps(10, 20).shortTick, 1);
    // 2 x 25 / 2 = 25 columns; short ticks every round(2.5) = 3; labels grow to 27.
    EXPECT_EQ(RulerSteps(2, 25).shortTick, 3);
    EXPECT_EQ(RulerSteps(2, 25).label, 27);
    EXPECT_EQ(RulerSteps(0, 25).label, 10) << "no growth at scale 0";
    EXPECT_EQ(RulerSteps(0.01, 30).label, 6000);
    std::mt19937 random(7);
    std::uniform_real_distribution<double> scales(0.01, 20);
    std::uniform_int_distribution<int> widths(0, 60);
    for (int i = 0; i < 2000; ++i) {
        const double scale = std::floor(scales(random) * 100) / 100;
        const int width = widths(random);
        const CRulerSteps expected = LiteralRulerSteps(scale, width, 10, 1);
        const CRulerSteps steps = RulerSteps(scale, width, 10, 1);
        ASSERT_EQ(steps.label, expected.label) << scale << " " << width;
        ASSERT_EQ(steps.shortTick, expected.shortTick) << scale << " " << width;
    }
}

TEST(RowGeometry, RulerMarks) {
    const CRulerSteps steps{27, 3};
    EXPECT_EQ(RulerMarkAt(0, steps), RulerMark::kLabel) << "column 1 is always labelled";
    EXPECT_EQ(RulerMarkAt(26, steps), RulerMark::kLabel);
    EXPECT_EQ(RulerMarkAt(53, steps), RulerMark::kLabel);
    EXPECT_EQ(RulerMarkAt(2, steps), RulerMark::kShortTick);
    EXPECT_EQ(RulerMarkAt(3, steps), RulerMark::kNone);
    EXPECT_EQ(RulerMarkAt(1, {10, 1}), RulerMark::kShortTick);
}

}  // namespace
