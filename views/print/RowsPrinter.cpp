#include "print/RowsPrinter.h"

#include <QFont>
#include <QPagedPaintDevice>
#include <QPainter>
#include <QPrinter>
#include <algorithm>

namespace {

// Header and footer text size, in pane pixels.
constexpr int kBandFontPixels = 12;
// The line under the header, above the band's bottom.
constexpr double kHeaderLineLiftMm = 2.0;

QRectF ToPixels(const CRectMm& rect) {
    return {0, 0, rect.width / kMmPerPixel, rect.height / kMmPerPixel};
}

// Moves the painter (in millimetres) to the top left of `x`, `y` and makes its unit a pane pixel.
void EnterPixels(QPainter& painter, double x, double y) {
    painter.translate(x, y);
    painter.scale(kMmPerPixel, kMmPerPixel);
}

}  // namespace

CRowsPrinter::CRowsPrinter(const IPrintableRows& rows, const CPrintSetup& setup,
                           CPageTextContext context)
    : m_rows(rows), m_setup(setup), m_context(std::move(context)) {}

CRowPrintOptions CRowsPrinter::Options() {
    CRowPrintOptions options;
    options.printing = true;
    // At printer resolution the font advances by other widths than on the screen.
    options.textPerCharacter = true;
    return options;
}

CRowsMetrics CRowsPrinter::Metrics() const {
    const CRowPrintOptions options = Options();
    CRowsMetrics metrics;
    metrics.leftWidth = m_rows.LeftWidth(options) * kMmPerPixel;
    metrics.columnWidth = m_rows.ColumnWidth(options) * kMmPerPixel;
    metrics.columnCount = m_rows.ColumnCount();
    const int rowCount = m_rows.PrintRowCount();
    metrics.rowHeights.reserve(rowCount);
    for (int row = 0; row < rowCount; ++row) {
        metrics.rowHeights.push_back(m_rows.PrintRowHeight(row, options) * kMmPerPixel);
    }
    return metrics;
}

bool CRowsPrinter::Plan(QSizeF page, CPrintPlan& plan, CPageBands& bands, QString& error) const {
    const std::optional<CPageBands> found = PageBands(page, m_setup);
    if (!found) {
        error = QString::fromLatin1(PrintMessages::kNoRoom);
        return false;
    }
    bands = *found;
    plan = PlanPrint(Metrics(), bands.body.width, bands.body.height);
    if (plan.pageCount == 0) {
        error = QString::fromLatin1(PrintMessages::kNothingToPrint);
        return false;
    }
    return true;
}

void CRowsPrinter::PreparePage(QPagedPaintDevice& device) const {
    if (!m_setup.paper.isEmpty()) {
        device.setPageSize(QPageSize(m_setup.paper, QPageSize::Millimeter));
    }
    // The page setup's margins are the only ones: the painter starts at the paper's corner.
    device.setPageMargins(QMarginsF(), QPageLayout::Millimeter);
    if (auto* printer = dynamic_cast<QPrinter*>(&device)) {
        printer->setFullPage(true);
    }
}

int CRowsPrinter::PageCount(QPagedPaintDevice& device, QString& error) const {
    PreparePage(device);
    CPrintPlan plan;
    CPageBands bands;
    return Plan(device.pageLayout().fullRect(QPageLayout::Millimeter).size(), plan, bands, error)
               ? plan.pageCount
               : 0;
}

bool CRowsPrinter::Print(QPagedPaintDevice& device, QString& error) const {
    PreparePage(device);
    CPrintPlan plan;
    CPageBands bands;
    if (!Plan(device.pageLayout().fullRect(QPageLayout::Millimeter).size(), plan, bands, error)) {
        return false;
    }
    int first = 0;
    int last = plan.pageCount - 1;
    auto* printer = dynamic_cast<QPrinter*>(&device);
    if (printer && printer->printRange() == QPrinter::PageRange && printer->fromPage() > 0) {
        first = std::min(printer->fromPage() - 1, last);
        last = std::clamp(printer->toPage() - 1, first, last);
    }
    QPainter painter;
    if (!painter.begin(&device)) {
        const QString file = printer ? printer->outputFileName() : QString();
        error = file.isEmpty() ? QString::fromLatin1(PrintMessages::kPrinterNotOpened)
                               : QString::fromLatin1(PrintMessages::kFileNotWritten).arg(file);
        return false;
    }
    for (int page = first; page <= last; ++page) {
        if (page > first) {
            device.newPage();
        }
        PaintPage(painter, plan, bands, page);
    }
    return painter.end();
}

void CRowsPrinter::PaintPage(QPainter& painter, const CPrintPlan& plan, const CPageBands& bands,
                             int page) const {
    painter.save();
    const QPaintDevice* device = painter.device();
    painter.scale(device->logicalDpiX() / 25.4, device->logicalDpiY() / 25.4);
    if (bands.header) {
        PaintBand(painter, *bands.header, m_setup.header, page, plan.pageCount, true);
    }
    if (bands.footer) {
        PaintBand(painter, *bands.footer, m_setup.footer, page, plan.pageCount, false);
    }
    for (const CPrintPiece& piece : plan.PiecesOfPage(page)) {
        PaintPiece(painter, bands.body, piece);
    }
    painter.restore();
}

void CRowsPrinter::PaintPiece(QPainter& painter, const CRectMm& body,
                              const CPrintPiece& piece) const {
    painter.save();
    EnterPixels(painter, body.x, body.y + piece.y);
    m_rows.PaintRange(painter, QPoint(0, 0), piece.firstColumn, piece.endColumn, piece.firstRow,
                      piece.endRow, Options());
    painter.restore();
}

void CRowsPrinter::PaintBand(QPainter& painter, const CRectMm& band, const QString& codes,
                             int page, int pageCount, bool lineBelow) const {
    CPageTextContext context = m_context;
    context.page = page + 1;
    context.pageCount = pageCount;
    const CPageTextParts parts = ExpandHeaderFooter(codes, context);
    painter.save();
    EnterPixels(painter, band.x, band.y);
    QRectF area = ToPixels(band);
    if (lineBelow) {
        area.setBottom(area.bottom() - kHeaderLineLiftMm / kMmPerPixel);
        painter.setPen(QPen(Qt::black, 0));
        painter.drawLine(QPointF(0, area.bottom()), QPointF(area.right(), area.bottom()));
    }
    QFont font(QStringLiteral("Helvetica"));
    font.setStyleHint(QFont::SansSerif);
    font.setPixelSize(kBandFontPixels);
    painter.setFont(font);
    painter.setPen(Qt::black);
    painter.drawText(area, Qt::AlignLeft | Qt::AlignVCenter, parts.left);
    painter.drawText(area, Qt::AlignHCenter | Qt::AlignVCenter, parts.centre);
    painter.drawText(area, Qt::AlignRight | Qt::AlignVCenter, parts.right);
    painter.restore();
}
