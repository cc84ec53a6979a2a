#include "print/FigureExport.h"

#include <QBuffer>
#include <QFileInfo>
#include <QImage>
#include <QPageSize>
#include <QPainter>
#include <QPdfWriter>
#include <QSvgGenerator>
#include <algorithm>
#include <cmath>

#include "print/PrintLayout.h"
#include "SafeSave.h"

namespace {

// Raster figures stay within what QPainter draws and what memory holds.
constexpr int kMaxImageSide = 32767;
constexpr qint64 kMaxImagePixels = 200'000'000;
// Panes measure in pixels at 96 to the inch.
constexpr int kDotsPerMeter96 = 3780;

// What to draw and at which scale.
struct CFigure {
    const IPrintableRows& rows;
    CRowPrintOptions options;
    int firstColumn;
    int endColumn;
    QSize size;    // as the pane paints it
    double scale;  // figure pixels per pane pixel
    QSize scaled;  // of the figure

    void Paint(QPainter& painter, double deviceScale) const {
        painter.scale(scale * deviceScale, scale * deviceScale);
        painter.fillRect(QRect(QPoint(), size), Qt::white);
        rows.PaintRange(painter, QPoint(0, 0), firstColumn, endColumn, 0, rows.PrintRowCount(),
                        options);
    }
};

bool WriteSvg(const CFigure& figure, QIODevice& file, const QString& title) {
    QSvgGenerator generator;
    generator.setOutputDevice(&file);
    generator.setSize(figure.scaled);
    generator.setViewBox(QRect(QPoint(), figure.scaled));
    generator.setResolution(96);
    generator.setTitle(title);
    generator.setDescription(QStringLiteral("Drawn by Tiler Blocks"));
    QPainter painter;
    if (!painter.begin(&generator)) {
        return false;
    }
    figure.Paint(painter, 1.0);
    return painter.end();
}

bool WritePng(const CFigure& figure, QIODevice& file, QString& error) {
    const QSize size = figure.scaled;
    if (size.width() > kMaxImageSide || size.height() > kMaxImageSide ||
        qint64(size.width()) * size.height() > kMaxImagePixels) {
        error = QStringLiteral("The image would be %1 x %2 pixels: ask for a smaller --width "
                               "or fewer --columns.")
                    .arg(size.width())
                    .arg(size.height());
        return false;
    }
    QImage image(size, QImage::Format_ARGB32_Premultiplied);
    if (image.isNull()) {
        error = QStringLiteral("Not enough memory for an image of %1 x %2 pixels.")
                    .arg(size.width())
                    .arg(size.height());
        return false;
    }
    image.setDotsPerMeterX(kDotsPerMeter96);
    image.setDotsPerMeterY(kDotsPerMeter96);
    {
        QPainter painter(&image);
        figure.Paint(painter, 1.0);
    }
    return image.save(&file, "PNG");
}

bool WritePdf(const CFigure& figure, QIODevice& file, const QString& title) {
    QPdfWriter writer(&file);
    writer.setCreator(QStringLiteral("Tiler Blocks"));
    writer.setTitle(title);
    const QSizeF page(figure.scaled.width() * kMmPerPixel, figure.scaled.height() * kMmPerPixel);
    writer.setPageSize(QPageSize(page, QPageSize::Millimeter));
    writer.setPageMargins(QMarginsF(), QPageLayout::Millimeter);
    QPainter painter;
    if (!painter.begin(&writer)) {
        return false;
    }
    figure.Paint(painter, writer.logicalDpiX() / 96.0);
    return painter.end();
}

}  // namespace

std::optional<FigureFormat> FigureFormatOf(const QString& path, QString* error) {
    const QString suffix = QFileInfo(path).suffix().toLower();
    if (suffix == u"svg") {
        return FigureFormat::svg;
    }
    if (suffix == u"png") {
        return FigureFormat::png;
    }
    if (suffix == u"pdf") {
        return FigureFormat::pdf;
    }
    if (error) {
        *error = QStringLiteral("\"%1\": the figure's file name must end in .svg, .png or .pdf.")
                     .arg(path);
    }
    return std::nullopt;
}

int WriteFigure(const IPrintableRows& rows, const QString& path, const CFigureOptions& options,
                QString& error) {
    const std::optional<FigureFormat> format = FigureFormatOf(path, &error);
    if (!format) {
        return kFigureFailed;
    }
    CRowPrintOptions paint;
    paint.printing = true;
    // Each residue at its column: a scaled or high-resolution font advances by other widths
    // than the screen's, and SVG keeps every residue a text element of its own.
    paint.textPerCharacter = true;
    const int columns = rows.ColumnCount();
    const int first = std::max(0, options.firstColumn);
    const int end = options.endColumn < 0 ? columns : std::min(options.endColumn, columns);
    if (columns == 0 || rows.PrintRowCount() == 0) {
        error = QStringLiteral("There is nothing to draw: the project has no sequences.");
        return kFigureNothingToDraw;
    }
    if (first >= end) {
        error = QStringLiteral("There is nothing to draw in those columns: the alignment has "
                               "%1 columns.")
                    .arg(columns);
        return kFigureNothingToDraw;
    }
    const QSize size = rows.ContentSize(first, end, 0, rows.PrintRowCount(), paint);
    if (size.isEmpty()) {
        error = QStringLiteral("There is nothing to draw.");
        return kFigureNothingToDraw;
    }
    const double scale = options.width > 0 ? double(options.width) / size.width() : 1.0;
    const QSize scaled(options.width > 0 ? options.width : size.width(),
                       std::max(1, int(std::lround(size.height() * scale))));
    const CFigure figure{rows, paint, first, end, size, scale, scaled};

    // Drawn in memory first, then saved as every file of the program is.
    QBuffer file;
    file.open(QIODevice::WriteOnly);
    const QString title = QFileInfo(path).completeBaseName();
    bool written = false;
    switch (*format) {
        case FigureFormat::svg:
            written = WriteSvg(figure, file, title);
            break;
        case FigureFormat::png:
            written = WritePng(figure, file, error);
            break;
        case FigureFormat::pdf:
            written = WritePdf(figure, file, title);
            break;
    }
    QString reason;
    if (!written || !SaveFileContents(path, file.data(), &reason)) {
        if (error.isEmpty()) {
            error = QStringLiteral("The file \"%1\" could not be written.").arg(path);
            if (!reason.isEmpty())
                error += QLatin1Char('\n') + reason;
        }
        return kFigureFailed;
    }
    return kFigureDone;
}
