#include <QImage>
#include <QPainter>

#include "AlnFixture.h"
#include "StoredColour.h"

namespace {

// The block holding a molecule entry's residue, found from the block set.
const CSimBlock* BlockWith(const CBlockProject& project, int entry, int position) {
    const CSimBlockSet& blocks = project.BlockSet();
    for (int b = 0; b < blocks.BlockCount(); ++b) {
        const CSimBlock& block = *blocks.BlockAt(b);
        for (int m = 0; m < block.MemberCount(); ++m) {
            const int start = block.Start(CSimBlock::kCurrent, m);
            if (block.Member(m) == entry && position >= start &&
                position < start + block.Width(CSimBlock::kCurrent))
                return &block;
        }
    }
    return nullptr;
}

class AlnImageTest : public AlnPaneTest {
  protected:
    void SetUp() override {
        AlnPaneTest::SetUp();
        m_project.Params().SetTextColour(0x00FF0000);        // blue
        m_project.Params().SetLinkedTextColour(0x000000FF);  // red
        m_pane.OnUpdate(nullptr, kHintAll);
        for (int b = 0; b < m_project.BlockSet().BlockCount(); ++b)
            m_pane.ShowBlockSelected(*m_project.BlockSet().BlockAt(b), true, false);
    }

    // The background every cell should have: the colour of the block holding its residue, none
    // for residues outside blocks and for B's gap (the block on its right starts after it).
    QColor ExpectedBackground(int entry, int column, const QColor& none) {
        static const int kResidueOf[3][14] = {{0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, -1, -1},
                                              {0, 1, 2, 3, -1, -1, 4, 5, 6, 7, 8, 9, -1, -1},
                                              {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13}};
        const int residue = kResidueOf[entry][column];
        const CSimBlock* block = residue < 0 ? nullptr : BlockWith(m_project, entry, residue);
        return block ? StoredColour(m_project.BlockColourById(block->Identifier()), none) : none;
    }

    // The strongest ink of a cell: the pixel farthest from its background.
    static QColor Ink(const QImage& image, const QRect& cell) {
        const QColor background = image.pixelColor(cell.topLeft());
        QColor ink = background;
        int farthest = 0;
        for (int y = cell.top(); y <= cell.bottom(); ++y) {
            for (int x = cell.left(); x <= cell.right(); ++x) {
                const QColor c = image.pixelColor(x, y);
                const int distance = std::abs(c.red() - background.red()) +
                                     std::abs(c.green() - background.green()) +
                                     std::abs(c.blue() - background.blue());
                if (distance > farthest) {
                    farthest = distance;
                    ink = c;
                }
            }
        }
        return ink;
    }

    // Checks every cell of rows A, B, C painted with `axis`, rows at `tops`: `none` behind
    // residues outside blocks, `beyond` where a row has ended.
    void CheckCells(const QImage& image, const CColumnAxis& axis, const int (&tops)[3], int height,
                    const QColor& none, const QColor& beyond) {
        for (int entry = 0; entry < 3; ++entry) {
            for (int column = 0; column < 14; ++column) {
                const int left = static_cast<int>(std::ceil(ColumnLeft(axis, column)));
                const int right = static_cast<int>(ColumnLeft(axis, column + 1)) - 1;
                const QRect cell(QPoint(left, tops[entry]),
                                 QPoint(right, tops[entry] + height - 1));
                const QColor expected =
                    entry < 2 && column >= 12 ? beyond : ExpectedBackground(entry, column, none);
                EXPECT_EQ(image.pixelColor(cell.topLeft()), expected)
                    << "row " << entry << " column " << column;
            }
        }
    }
};

TEST_F(AlnImageTest, ScreenShowsBlockColoursAndTextColours) {
    const QImage image = Viewport()->grab().toImage().convertToFormat(QImage::Format_RGB32);
    const QColor window = Ctrl().palette().color(QPalette::Base);
    const int tops[3] = {Ctrl().RowRect(Row("A"))->top(), Ctrl().RowRect(Row("B"))->top(),
                         Ctrl().RowRect(Row("C"))->top()};
    CheckCells(image, Ctrl().Axis(), tops, Ctrl().RowRect(Row("A"))->height(), window, window);

    auto cell = [&](const char* name, int column) {
        const CColumnAxis axis = Ctrl().Axis();
        const QRect row = *Ctrl().RowRect(Row(name));
        return QRect(static_cast<int>(ColumnLeft(axis, column)), row.top(),
                     static_cast<int>(axis.scale), row.height());
    };
    const QColor linked = Ink(image, cell("A", 7));  // 'G', linked
    EXPECT_GT(linked.red(), linked.blue() + 100) << "linked residues in the linked colour";
    const QColor plain = Ink(image, cell("A", 0));  // 'm'
    EXPECT_GT(plain.blue(), plain.red() + 100) << "other residues in the unlinked colour";
    const QColor gap = Ink(image, cell("B", 4));
    EXPECT_LT(gap.red() + gap.green() + gap.blue(), 200) << "gaps in the window text colour";
}

TEST_F(AlnImageTest, SelectionInvertsItsCells) {
    const QImage before = Viewport()->grab().toImage().convertToFormat(QImage::Format_RGB32);
    Drag(Cell("A", 1), Cell("A", 2));
    const QImage after = Viewport()->grab().toImage().convertToFormat(QImage::Format_RGB32);
    const CColumnAxis axis = Ctrl().Axis();
    const QRect row = *Ctrl().RowRect(Row("A"));
    for (int column : {1, 2}) {
        const QPoint corner(static_cast<int>(ColumnLeft(axis, column)) + 1, row.top() + 1);
        const QRgb was = before.pixel(corner);
        EXPECT_EQ(after.pixel(corner) & 0xFFFFFF, ~was & 0xFFFFFF) << "column " << column;
    }
    const QPoint outside(static_cast<int>(ColumnLeft(axis, 3)) + 1, row.top() + 1);
    EXPECT_EQ(after.pixel(outside), before.pixel(outside));
}

TEST_F(AlnImageTest, PrintedRowsHaveWhiteEmptyCellsAndTheSameColours) {
    for (const double width : {0.0, 3.0, 14.0}) {
        CRowPrintOptions options;
        options.columnWidth = width;
        options.textPerCharacter = width == 14.0;
        const IPrintableRows& rows = *m_pane.PrintableRows();
        ASSERT_EQ(rows.PrintRowCount(), 4) << "ruler and three molecules";
        const QSize size = rows.ContentSize(0, 14, 0, 4, options);
        int height = 0;
        for (int r = 0; r < 4; ++r)
            height += rows.PrintRowHeight(r, options);
        EXPECT_EQ(size.height(), height);
        QImage image(size + QSize(20, 20), QImage::Format_RGB32);
        image.fill(Qt::black);
        QPainter painter(&image);
        rows.PaintRange(painter, QPoint(10, 10), 0, 14, 0, 4, options);
        painter.end();
        const CColumnAxis axis{10 + rows.LeftWidth(options), rows.ColumnWidth(options), 0, 14};
        const int ruler = rows.PrintRowHeight(0, options);
        const int rowHeight = rows.PrintRowHeight(1, options);
        const int tops[3] = {10 + ruler, 10 + ruler + rowHeight, 10 + ruler + 2 * rowHeight};
        // Cells beyond a row's end are not drawn: the black canvas shows through.
        SCOPED_TRACE(width);
        CheckCells(image, axis, tops, rowHeight, Qt::white, Qt::black);
        EXPECT_EQ(image.pixelColor(static_cast<int>(ColumnLeft(axis, 4)) + 1, 11),
                  QColor(0xC0, 0xC0, 0xC0))
            << "the ruler's grey";
    }
}

}  // namespace
