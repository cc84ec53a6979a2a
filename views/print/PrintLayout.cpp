#include "print/PrintLayout.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <tuple>

namespace {

// Rounding of millimetre sums must not lose a column or a row that fits exactly.
constexpr double kSlackMm = 1e-6;

double StoredToMm(int value, bool metric) {
    return metric ? value / 100.0 : value * 25.4 / 1000.0;
}

// How many lengths of `step` fit in `room`, at least `minimum`.
int CountFitting(double room, double step, int minimum) {
    if (step <= 0) {
        return minimum;
    }
    return std::max(minimum, static_cast<int>(std::floor((room + kSlackMm) / step)));
}

// The rows of one stretch split into runs that each fit `height`; a row taller than the
// height gets a run of its own.
std::vector<std::pair<int, int>> SplitRows(const std::vector<double>& heights, double height) {
    std::vector<std::pair<int, int>> runs;
    int first = 0;
    double used = 0;
    for (int row = 0; row < static_cast<int>(heights.size()); ++row) {
        if (row > first && used + heights[row] > height + kSlackMm) {
            runs.emplace_back(first, row);
            first = row;
            used = 0;
        }
        used += heights[row];
    }
    runs.emplace_back(first, static_cast<int>(heights.size()));
    return runs;
}

}  // namespace

CPrintSetup PrintSetupFromStored(int marginLeft, int marginRight, int marginTop, int marginBottom,
                                 bool metric, const QString& header, const QString& footer,
                                 int paperWidth, int paperHeight) {
    CPrintSetup setup;
    setup.margins = {StoredToMm(marginLeft, metric), StoredToMm(marginRight, metric),
                     StoredToMm(marginTop, metric), StoredToMm(marginBottom, metric)};
    setup.header = header;
    setup.footer = footer;
    if (paperWidth > 0 && paperHeight > 0) {
        setup.paper = QSizeF(StoredToMm(paperWidth, metric), StoredToMm(paperHeight, metric));
    }
    return setup;
}

std::optional<CPageBands> PageBands(QSizeF page, const CPrintSetup& setup) {
    const CPrintMargins& m = setup.margins;
    CPageBands bands;
    CRectMm& body = bands.body;
    body = {m.left, m.top, page.width() - m.left - m.right, page.height() - m.top - m.bottom};
    if (!setup.header.isEmpty()) {
        bands.header = CRectMm{body.x, body.y, body.width, kHeaderBandMm};
        body.y += kHeaderBandMm;
        body.height -= kHeaderBandMm;
    }
    if (!setup.footer.isEmpty()) {
        body.height -= kFooterBandMm;
        bands.footer = CRectMm{body.x, body.y + body.height, body.width, kFooterBandMm};
    }
    if (body.width <= 0 || body.height <= 0 || m.left < 0 || m.right < 0 || m.top < 0 ||
        m.bottom < 0) {
        return std::nullopt;
    }
    return bands;
}

CPrintPlan PlanPrint(const CRowsMetrics& rows, double bodyWidth, double bodyHeight) {
    CPrintPlan plan;
    plan.columnCount = rows.columnCount;
    if (rows.columnCount <= 0 || rows.rowHeights.empty() || bodyWidth <= 0 || bodyHeight <= 0) {
        return plan;
    }
    plan.columnsPerStretch = std::min(
        rows.columnCount, CountFitting(bodyWidth - rows.leftWidth, rows.columnWidth, 1));
    plan.stretchCount = (rows.columnCount + plan.columnsPerStretch - 1) / plan.columnsPerStretch;
    plan.stretchHeight = std::accumulate(rows.rowHeights.begin(), rows.rowHeights.end(), 0.0);
    plan.rowRuns = SplitRows(rows.rowHeights, bodyHeight);
    if (plan.rowRuns.size() > 1) {
        plan.stretchesPerPage = 1;
        plan.pageCount = plan.stretchCount * static_cast<int>(plan.rowRuns.size());
    } else {
        plan.stretchesPerPage =
            CountFitting(bodyHeight, plan.stretchHeight + kStretchGapMm, 1);
        plan.pageCount = (plan.stretchCount + plan.stretchesPerPage - 1) / plan.stretchesPerPage;
    }
    return plan;
}

std::vector<CPrintPiece> CPrintPlan::PiecesOfPage(int page) const {
    std::vector<CPrintPiece> pieces;
    if (page < 0 || page >= pageCount) {
        return pieces;
    }
    auto columnsOf = [this](int stretch, CPrintPiece& piece) {
        piece.firstColumn = stretch * columnsPerStretch;
        piece.endColumn = std::min(columnCount, piece.firstColumn + columnsPerStretch);
    };
    const int runs = static_cast<int>(rowRuns.size());
    if (runs > 1) {
        CPrintPiece piece;
        columnsOf(page / runs, piece);
        std::tie(piece.firstRow, piece.endRow) = rowRuns[page % runs];
        pieces.push_back(piece);
        return pieces;
    }
    const int first = page * stretchesPerPage;
    const int end = std::min(stretchCount, first + stretchesPerPage);
    for (int stretch = first; stretch < end; ++stretch) {
        CPrintPiece piece;
        columnsOf(stretch, piece);
        std::tie(piece.firstRow, piece.endRow) = rowRuns.front();
        piece.y = (stretch - first) * (stretchHeight + kStretchGapMm);
        pieces.push_back(piece);
    }
    return pieces;
}
