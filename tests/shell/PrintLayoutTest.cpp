// Page bands, stretches and pages of printed rows, and the header and footer codes.
#include <gtest/gtest.h>

#include <QDate>
#include <QLocale>

#include "QtPrinters.h"
#include "print/HeaderFooter.h"
#include "print/PrintLayout.h"

namespace {

const QSizeF kA4(210, 297);

CPrintSetup MarginSetup(double margin, const QString& header = {}, const QString& footer = {}) {
    CPrintSetup setup;
    setup.margins = {margin, margin, margin, margin};
    setup.header = header;
    setup.footer = footer;
    return setup;
}

// Rows of `count` rows each `rowHeight` high.
CRowsMetrics Rows(double left, double column, int columns, int count, double rowHeight) {
    return {left, column, columns, std::vector<double>(count, rowHeight)};
}

CPageTextContext Context(const QString& path, int page, int pages) {
    return {QDateTime(QDate(2024, 3, 9), QTime(14, 5, 7)), path, page, pages};
}

}  // namespace

TEST(HeaderFooter, PlacementCodesTakeTheTextBeforeThem) {
    const CPageTextContext context = Context(QStringLiteral("/data/kinases.bpr"), 3, 12);
    const QString date = QLocale().toString(QDate(2024, 3, 9), QLocale::ShortFormat);
    // The defaults: the date centred; the file name and page at the left.
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("&D&c"), context), (CPageTextParts{{}, date, {}}));
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("&s Page &p&l"), context),
              (CPageTextParts{QStringLiteral("kinases.bpr Page 3"), {}, {}}));
    // All three places; text after the last code goes to the left.
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("&f&lAlignment&c&p of &P&rtail"), context),
              (CPageTextParts{QStringLiteral("/data/kinases.bpr") + QStringLiteral("tail"),
                              QStringLiteral("Alignment"), QStringLiteral("3 of 12")}));
    // Two codes of one place join their texts.
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("a&lb&l"), context),
              (CPageTextParts{QStringLiteral("ab"), {}, {}}));
}

TEST(HeaderFooter, LiteralsUnknownCodesAndUnsavedProjects) {
    const CPageTextContext unsaved = Context({}, 1, 1);
    // "&&" is one ampersand, an unknown code stays as typed, a lone "&" at the end too.
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("R&&D &x 5&"), unsaved).left,
              QStringLiteral("R&D &x 5&"));
    // An unsaved project has no file name: the codes expand to nothing, not to "&s".
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("[&s][&f]&r"), unsaved).right,
              QStringLiteral("[][]"));
    EXPECT_EQ(ExpandHeaderFooter(QStringLiteral("&T"), unsaved).left,
              QLocale().toString(QTime(14, 5, 7), QLocale::LongFormat));
    EXPECT_TRUE(ExpandHeaderFooter({}, unsaved).IsEmpty());
}

TEST(PrintSetup, StoredUnitsBecomeMillimetres) {
    // Thousandths of an inch: 750 = 19.05 mm, 500 = 12.7 mm; Letter is 8500 x 11000.
    const CPrintSetup inch = PrintSetupFromStored(750, 750, 500, 500, false, {}, {}, 8500, 11000);
    EXPECT_DOUBLE_EQ(inch.margins.left, 19.05);
    EXPECT_DOUBLE_EQ(inch.margins.top, 12.7);
    EXPECT_DOUBLE_EQ(inch.paper.width(), 215.9);
    EXPECT_DOUBLE_EQ(inch.paper.height(), 279.4);
    // Hundredths of a millimetre; a paper size of 0 is the printer's own.
    const CPrintSetup metric = PrintSetupFromStored(2000, 1500, 1000, 2550, true, {}, {});
    EXPECT_DOUBLE_EQ(metric.margins.right, 15.0);
    EXPECT_DOUBLE_EQ(metric.margins.bottom, 25.5);
    EXPECT_TRUE(metric.paper.isEmpty());
}

TEST(PageBands, HeaderAndFooterTakeTenMillimetresEachOnlyWithText) {
    const auto plain = PageBands(kA4, MarginSetup(20));
    ASSERT_TRUE(plain);
    EXPECT_EQ(plain->body, (CRectMm{20, 20, 170, 257}));
    EXPECT_FALSE(plain->header);
    EXPECT_FALSE(plain->footer);

    const auto both =
        PageBands(kA4, MarginSetup(20, QStringLiteral("&D&c"), QStringLiteral("&p&r")));
    ASSERT_TRUE(both);
    EXPECT_EQ(*both->header, (CRectMm{20, 20, 170, 10}));
    EXPECT_EQ(both->body, (CRectMm{20, 30, 170, 237}));
    EXPECT_EQ(*both->footer, (CRectMm{20, 267, 170, 10}));
}

TEST(PageBands, MarginsThatLeaveNoRoomGiveNoPage) {
    EXPECT_FALSE(PageBands(kA4, MarginSetup(105)));  // the width is used up exactly
    EXPECT_FALSE(PageBands(kA4, MarginSetup(300)));  // margins larger than the page
    EXPECT_FALSE(PageBands(kA4, MarginSetup(-1)));   // negative margins
    // Left and right fit, but the header and footer bands eat the last of the height.
    CPrintSetup tall = MarginSetup(0, QStringLiteral("h"), QStringLiteral("f"));
    tall.margins.top = tall.margins.bottom = 138.5;
    EXPECT_FALSE(PageBands(kA4, tall));
    EXPECT_TRUE(PageBands(kA4, MarginSetup(104)));
    EXPECT_FALSE(PageBands(QSizeF(), MarginSetup(0)));
}

TEST(PrintPlan, StretchesShareAPageWhenTheyFit) {
    // Body 170 x 237 mm. Names of 27 mm leave 143 mm: 57 columns of 2.5 mm (57 x 2.5 = 142.5). 1000
    // columns make 18 stretches (17 x 57 = 969, the last has 31). A stretch of 10 rows x 4 mm = 40
    // mm plus the 5 mm gap: 5 per page (225 mm), so 4 pages.
    const CPrintPlan plan = PlanPrint(Rows(27, 2.5, 1000, 10, 4), 170, 237);
    EXPECT_EQ(plan.columnsPerStretch, 57);
    EXPECT_EQ(plan.stretchCount, 18);
    EXPECT_EQ(plan.stretchesPerPage, 5);
    EXPECT_EQ(plan.pageCount, 4);
    const auto last = plan.PiecesOfPage(3);
    ASSERT_EQ(last.size(), 3u);
    EXPECT_EQ(last[0], (CPrintPiece{15 * 57, 16 * 57, 0, 10, 0}));
    EXPECT_EQ(last[2], (CPrintPiece{17 * 57, 1000, 0, 10, 90}));
    EXPECT_TRUE(plan.PiecesOfPage(4).empty());
    EXPECT_TRUE(plan.PiecesOfPage(-1).empty());
}

TEST(PrintPlan, ExactFitsKeepTheirColumnAndStretch) {
    // 143 mm hold exactly 110 columns of 1.3 mm; 237 mm hold exactly 3 stretches of 74 + 5.
    const CPrintPlan plan = PlanPrint(Rows(27, 1.3, 330, 37, 2), 170, 237);
    EXPECT_EQ(plan.columnsPerStretch, 110);
    EXPECT_EQ(plan.stretchCount, 3);
    EXPECT_EQ(plan.stretchesPerPage, 3);
    EXPECT_EQ(plan.pageCount, 1);
}

TEST(PrintPlan, ATallStretchContinuesOverPagesBetweenRows) {
    // 100 rows of 5 mm in 237 mm: 47 rows a page (235 mm), so runs of 47, 47 and 6. 149.5 mm
    // beside the names hold 74 columns of 2 mm: 3 stretches of 3 pages each.
    const CPrintPlan plan = PlanPrint(Rows(20.5, 2, 150, 100, 5), 170, 237);
    EXPECT_EQ(plan.stretchCount, 3);
    ASSERT_EQ(plan.rowRuns.size(), 3u);
    EXPECT_EQ(plan.rowRuns[2], std::make_pair(94, 100));
    EXPECT_EQ(plan.pageCount, 9);
    EXPECT_EQ(plan.PiecesOfPage(4), (std::vector<CPrintPiece>{{74, 148, 47, 94, 0}}));
    // A row taller than the page gets a page of its own.
    std::vector<double> heights{10, 300, 10};
    const CPrintPlan giant = PlanPrint({20, 2, 10, heights}, 170, 237);
    ASSERT_EQ(giant.rowRuns.size(), 3u);
    EXPECT_EQ(giant.pageCount, 3);
}

TEST(PrintPlan, OneColumnWiderThanThePageStillPrints) {
    // Each column alone on its stretch, cut at the edge.
    const CPrintPlan plan = PlanPrint(Rows(20, 400, 7, 3, 4), 170, 237);
    EXPECT_EQ(plan.columnsPerStretch, 1);
    EXPECT_EQ(plan.stretchCount, 7);
    EXPECT_EQ(plan.pageCount, 1);  // 7 x (12 + 5) = 119 mm
    EXPECT_EQ(plan.PiecesOfPage(0).back(), (CPrintPiece{6, 7, 0, 3, 6 * 17}));

    // Names wider than the body (a very long molecule name) leave no room: still one column a
    // stretch, 13 stretches of 12 mm + 5 a page.
    const CPrintPlan names = PlanPrint(Rows(2000, 2.5, 100, 3, 4), 170, 237);
    EXPECT_EQ(names.columnsPerStretch, 1);
    EXPECT_EQ(names.stretchCount, 100);
    EXPECT_EQ(names.stretchesPerPage, 13);
    EXPECT_EQ(names.pageCount, 8);
}

TEST(PrintPlan, NothingToPrintMakesNoPages) {
    EXPECT_EQ(PlanPrint(Rows(20, 2, 0, 5, 4), 170, 237).pageCount, 0);
    EXPECT_EQ(PlanPrint(Rows(20, 2, 50, 0, 4), 170, 237).pageCount, 0);
    EXPECT_EQ(PlanPrint(Rows(20, 2, 50, 5, 4), 0, 237).pageCount, 0);
    EXPECT_EQ(PlanPrint(Rows(20, 2, 50, 5, 4), 170, -3).pageCount, 0);
}
