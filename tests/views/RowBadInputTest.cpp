#include <gtest/gtest.h>

#include <QImage>
#include <QPainter>
#include <QScrollBar>
#include <QTest>

#include "AlignmentPane.h"
#include "rows/SegmentWnd.h"
#include "rows/TilxCtrl.h"

namespace {

class CNoProject : public IPaneDocument {
  public:
    CBlockProject* Project() const override { return nullptr; }
    void SetModifiedFlag(bool) override {}
};

// Paints the whole range of a control's rows into an image.
void PaintAll(const IPrintableRows& rows) {
    const CRowPrintOptions options;
    const QSize size = rows.ContentSize(0, rows.ColumnCount(), 0, rows.PrintRowCount(), options);
    QImage image(size.boundedTo(QSize(4000, 4000)).expandedTo(QSize(1, 1)), QImage::Format_RGB32);
    QPainter painter(&image);
    rows.PaintRange(painter, QPoint(0, 0), 0, rows.ColumnCount(), 0, rows.PrintRowCount(), options);
}

TEST(RowBadInput, PaneWithoutProjectIsEmpty) {
    CNoProject document;
    CBlockAlnView pane;
    pane.SetDocument(&document);
    pane.resize(300, 200);
    pane.show();
    pane.OnUpdate(nullptr, kHintAll);
    EXPECT_EQ(pane.Ctrl()->RowCount(), 0);
    EXPECT_EQ(pane.PrintableRows()->ColumnCount(), 0);
    EXPECT_EQ(pane.PrintableRows()->PrintRowCount(), 0);
    EXPECT_FALSE(pane.Ctrl()->viewport()->grab().isNull());
    QTest::mouseClick(pane.Ctrl()->viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(50, 50));
    QTest::keyClick(pane.Ctrl()->viewport(), Qt::Key_Down);
    EXPECT_TRUE(pane.SelectionEntries().empty());
    EXPECT_FALSE(pane.SelectionForBroadcast().has_value());
    PaintAll(*pane.PrintableRows());
}

class RowExtremesTest : public ::testing::Test {
  protected:
    void SetUp() override {
        const std::string longName(10 * 1024, 'n');
        m_ctrl.AddRow(std::make_unique<CSegmentWnd>(QStringLiteral("empty"), "", m_colours));
        m_ctrl.AddRow(std::make_unique<CSegmentWnd>(QStringLiteral("one"), "m", m_colours));
        m_ctrl.AddRow(
            std::make_unique<CSegmentWnd>(QString::fromStdString(longName), "mkv", m_colours));
        m_ctrl.AddRow(std::make_unique<CSegmentWnd>(QStringLiteral("huge"),
                                                    std::string(100000, 'a'), m_colours));
        m_ctrl.resize(400, 200);
        m_ctrl.show();
        m_ctrl.Relayout();
    }

    CSegmentColours m_colours;
    CTilxCtrl m_ctrl;
};

TEST_F(RowExtremesTest, LongNamesNeverTakeMoreThanTheWindow) {
    EXPECT_EQ(m_ctrl.ColumnCount(), 100000);
    EXPECT_LE(m_ctrl.NameArea().width(), m_ctrl.viewport()->width());
    EXPECT_GE(m_ctrl.SequenceArea().width(), 0);
    m_ctrl.SetMaxNameLength(12);
    EXPECT_LT(m_ctrl.NameArea().width(), 200) << "cut names give a narrow area";
    EXPECT_FALSE(m_ctrl.viewport()->grab().isNull());
}

TEST_F(RowExtremesTest, ScrollingToTheEndOfAHugeRow) {
    m_ctrl.SetMaxNameLength(12);
    m_ctrl.ScrollToColumn(1 << 30);
    const int visible = m_ctrl.VisibleColumnCount();
    ASSERT_GT(visible, 0);
    EXPECT_EQ(m_ctrl.FirstColumn(), 100000 - visible);
    EXPECT_EQ(m_ctrl.horizontalScrollBar()->value(), m_ctrl.FirstColumn());
    // The short rows show their last residue number with a bullet; they paint nothing else.
    EXPECT_EQ(m_ctrl.RowAt(1)->PositionNumber(m_ctrl.FirstColumn()), -1);
    EXPECT_EQ(m_ctrl.RowAt(0)->PositionNumber(m_ctrl.FirstColumn()), 0);
    EXPECT_FALSE(m_ctrl.viewport()->grab().isNull());
    m_ctrl.ScrollToShowColumn(10);
    EXPECT_EQ(m_ctrl.FirstColumn(), 5);
}

TEST_F(RowExtremesTest, ZeroSizeAndFitToWidth) {
    m_ctrl.resize(0, 0);
    m_ctrl.Relayout();
    EXPECT_EQ(m_ctrl.VisibleColumnCount(), 0);
    EXPECT_EQ(m_ctrl.Placements().size(), 0u) << "no row fits";
    QTest::mouseClick(m_ctrl.viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(0, 0));
    m_ctrl.ScrollToShowColumn(500);

    CTilxCtrl::Flags flags = m_ctrl.GetFlags();
    flags.fitToWidth = true;
    m_ctrl.SetFlags(flags);
    EXPECT_EQ(m_ctrl.Scale(), 0) << "nothing fits in no width";
    m_ctrl.resize(500, 200);
    m_ctrl.SetMaxNameLength(12);
    m_ctrl.Relayout();
    const double expected = FitScale(m_ctrl.SequenceArea().width(), 4, 100000);
    EXPECT_DOUBLE_EQ(m_ctrl.Scale(), expected);
    EXPECT_EQ(m_ctrl.horizontalScrollBar()->maximum(), 0) << "all columns fit";
    EXPECT_FALSE(m_ctrl.viewport()->grab().isNull());
}

TEST_F(RowExtremesTest, PrintingAStretchOfAHugeRow) {
    const IPrintableRows& rows = m_ctrl;
    const CRowPrintOptions options;
    EXPECT_LT(rows.LeftWidth(options), 1000) << "the 10 KB name is cut on paper";
    const QSize size = rows.ContentSize(99900, 100000, 0, 4, options);
    EXPECT_EQ(size.height(), 4 * m_ctrl.RowAt(0)->RowHeight());
    QImage image(size.boundedTo(QSize(20000, 400)), QImage::Format_RGB32);
    QPainter painter(&image);
    rows.PaintRange(painter, QPoint(0, 0), 99900, 100000, 0, 4, options);
    rows.PaintRange(painter, QPoint(0, 0), -5, 1 << 30, -1, 99, options);  // clamped
}

}  // namespace
