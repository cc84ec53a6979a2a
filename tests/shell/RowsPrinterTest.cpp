// Printing rows page by page into PDF files: the pages the plan promises, page ranges, and
// refusals that leave files as they were.
#include <gtest/gtest.h>

#include <QFile>
#include <QFileInfo>
#include <QPainter>
#include <QPrinter>
#include <QTemporaryDir>
#include <cerrno>
#include <cstring>
#include <set>

#include "PrintTestHelpers.h"
#include "QtPrinters.h"
#include "print/PrintCommands.h"
#include "print/RowsPrinter.h"

namespace {

// Rows of fixed size that remember which columns and rows they were asked to paint.
class CFakeRows : public IPrintableRows {
  public:
    static constexpr int kLeft = 100;
    static constexpr int kColumn = 10;
    static constexpr int kRowHeight = 16;

    CFakeRows(int columns, int rows) : m_columns(columns), m_rows(rows) {}

    int ColumnCount() const override { return m_columns; }
    int PrintRowCount() const override { return m_rows; }
    int PrintRowHeight(int, const CRowPrintOptions&) const override { return kRowHeight; }
    int LeftWidth(const CRowPrintOptions&) const override { return kLeft; }
    double ColumnWidth(const CRowPrintOptions& options) const override {
        return options.columnWidth > 0 ? options.columnWidth : kColumn;
    }
    QSize ContentSize(int firstColumn, int endColumn, int firstRow, int endRow,
                      const CRowPrintOptions&) const override {
        return {kLeft + (endColumn - firstColumn) * kColumn, (endRow - firstRow) * kRowHeight};
    }
    void PaintRange(QPainter& painter, QPoint origin, int firstColumn, int endColumn, int firstRow,
                    int endRow, const CRowPrintOptions& options) const override {
        EXPECT_TRUE(options.printing);
        painted.insert({firstColumn, endColumn, firstRow, endRow});
        for (int row = firstRow; row < endRow; ++row) {
            const int y = origin.y() + (row - firstRow + 1) * kRowHeight;
            painter.drawText(origin.x(), y, QStringLiteral("row %1").arg(row));
            for (int column = firstColumn; column < endColumn; ++column) {
                painter.drawText(origin.x() + kLeft + (column - firstColumn) * kColumn, y,
                                 QStringLiteral("A"));
            }
        }
    }

    struct Range {
        int firstColumn, endColumn, firstRow, endRow;
        auto operator<=>(const Range&) const = default;
    };
    mutable std::set<Range> painted;

  private:
    int m_columns;
    int m_rows;
};

CPrintSetup A4Setup(double margin) {
    CPrintSetup setup;
    setup.margins = {margin, margin, margin, margin};
    setup.header = QStringLiteral("&D&c");
    setup.footer = QStringLiteral("&s Page &p&l");
    setup.paper = QSizeF(210, 297);
    return setup;
}

CPageTextContext Context() {
    return {QDateTime::currentDateTime(), QStringLiteral("projects/example.bpr")};
}

struct PdfPrinter {
    QPrinter printer{QPrinter::HighResolution};
    explicit PdfPrinter(const QString& path) {
        printer.setOutputFormat(QPrinter::PdfFormat);
        printer.setOutputFileName(path);
        printer.setPageOrientation(QPageLayout::Portrait);
    }
};

}  // namespace

TEST(RowsPrinter, PrintsThePagesThePlanCountsWithEveryColumnOnce) {
    // On A4 with 20 mm margins, header and footer, the body is 170 x 237 mm. The names (100
    // pixels = 26.46 mm) leave 143.54 mm: 54 columns of 2.65 mm a stretch, so 19 stretches for
    // 1000 columns. A stretch is 10 rows x 4.23 mm = 42.33 mm; with the 5 mm gap
    // 5 share a page: 4 pages.
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("rows.pdf"));
    const CFakeRows rows(1000, 10);
    const CRowsPrinter pages(rows, A4Setup(20), Context());
    PdfPrinter pdf(path);
    QString error;
    EXPECT_EQ(pages.PageCount(pdf.printer, error), 4);
    ASSERT_TRUE(pages.Print(pdf.printer, error)) << error.toStdString();
    EXPECT_EQ(PdfPageCount(path), 4);

    // Each stretch is painted in two passes (names, then columns) over the same range.
    int column = 0;
    for (const CFakeRows::Range& range : rows.painted) {
        EXPECT_EQ(range.firstColumn, column);
        EXPECT_EQ(range.endColumn - range.firstColumn, std::min(54, 1000 - column));
        EXPECT_EQ(range.firstRow, 0);
        EXPECT_EQ(range.endRow, 10);
        column = range.endColumn;
    }
    EXPECT_EQ(column, 1000);
    EXPECT_EQ(rows.painted.size(), 19u);
}

TEST(RowsPrinter, LandscapeAndPageRangesChangeThePages) {
    QTemporaryDir dir;
    const CFakeRows rows(1000, 10);
    const CRowsPrinter pages(rows, A4Setup(20), Context());

    // Landscape: body 257 x 150 mm, 87 columns (230.54 / 2.6458), 12 stretches, 3 a page.
    PdfPrinter landscape(dir.filePath(QStringLiteral("landscape.pdf")));
    landscape.printer.setPageOrientation(QPageLayout::Landscape);
    QString error;
    ASSERT_TRUE(pages.Print(landscape.printer, error));
    EXPECT_EQ(PdfPageCount(dir.filePath(QStringLiteral("landscape.pdf"))), 4);

    PdfPrinter range(dir.filePath(QStringLiteral("range.pdf")));
    range.printer.setPrintRange(QPrinter::PageRange);
    range.printer.setFromTo(2, 3);
    ASSERT_TRUE(pages.Print(range.printer, error));
    EXPECT_EQ(PdfPageCount(dir.filePath(QStringLiteral("range.pdf"))), 2);
}

TEST(RowsPrinter, MarginsLargerThanThePagePrintNothing) {
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("none.pdf"));
    const CFakeRows rows(100, 4);
    const CRowsPrinter pages(rows, A4Setup(150), Context());
    PdfPrinter pdf(path);
    QString error;
    EXPECT_EQ(pages.PageCount(pdf.printer, error), 0);
    EXPECT_FALSE(pages.Print(pdf.printer, error));
    EXPECT_EQ(error, QString::fromLatin1(PrintMessages::kNoRoom));
    EXPECT_FALSE(QFile::exists(path));

    // Export to PDF leaves an existing file as it was.
    QFile old(path);
    ASSERT_TRUE(old.open(QIODevice::WriteOnly));
    old.write("earlier figure");
    old.close();
    error.clear();
    EXPECT_FALSE(WritePdf(path, pdf.printer.pageLayout(), pages, error));
    EXPECT_EQ(error, QString::fromLatin1(PrintMessages::kNoRoom));
    ASSERT_TRUE(old.open(QIODevice::ReadOnly));
    EXPECT_EQ(old.readAll(), QByteArray("earlier figure"));
}

TEST(RowsPrinter, APrinterThatCannotBeOpenedIsReported) {
    QTemporaryDir dir;
    const QString missing = dir.filePath(QStringLiteral("no/such/folder/out.pdf"));
    const CFakeRows rows(100, 4);
    const CRowsPrinter pages(rows, A4Setup(20), Context());
    PdfPrinter pdf(missing);
    QString error;
    EXPECT_FALSE(pages.Print(pdf.printer, error));
    EXPECT_EQ(error, QString::fromLatin1(PrintMessages::kFileNotWritten).arg(missing));

    error.clear();
    EXPECT_FALSE(WritePdf(missing, pdf.printer.pageLayout(), pages, error));
    EXPECT_EQ(error, QString::fromLatin1(PrintMessages::kFileNotWritten).arg(missing) + "\n" +
                         QString::fromLocal8Bit(std::strerror(ENOENT)));
}

// Export to PDF saves as every file of the program does: through a link, which stays a link.
TEST(RowsPrinter, PdfExportFollowsLinksAndReportsAFullDevice) {
    QTemporaryDir dir;
    const QString target = dir.filePath(QStringLiteral("figure.pdf"));
    const QString link = dir.filePath(QStringLiteral("link.pdf"));
    ASSERT_TRUE(QFile::link(target, link));
    const CFakeRows rows(100, 4);
    const CRowsPrinter pages(rows, A4Setup(20), Context());
    PdfPrinter pdf(target);
    QString error;
    ASSERT_TRUE(WritePdf(link, pdf.printer.pageLayout(), pages, error)) << error.toStdString();
    EXPECT_TRUE(QFileInfo(link).isSymLink());
    QFile written(target);
    ASSERT_TRUE(written.open(QIODevice::ReadOnly));
    EXPECT_TRUE(written.read(5) == "%PDF-");
}

TEST(RowsPrinter, EmptyRowsHaveNothingToPrint) {
    const CFakeRows rows(0, 4);
    EXPECT_FALSE(CanPrint(&rows));
    EXPECT_FALSE(CanPrint(nullptr));
    const CFakeRows some(3, 1);
    EXPECT_TRUE(CanPrint(&some));

    QTemporaryDir dir;
    PdfPrinter pdf(dir.filePath(QStringLiteral("empty.pdf")));
    const CRowsPrinter pages(rows, A4Setup(20), Context());
    QString error;
    EXPECT_FALSE(pages.Print(pdf.printer, error));
    EXPECT_EQ(error, QString::fromLatin1(PrintMessages::kNothingToPrint));
}
