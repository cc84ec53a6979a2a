#pragma once
// Where printed rows go on paper: the page's header, body and footer bands, and the stretches
// of columns and the pages they fill. Plain geometry in millimetres.
//
// A stretch is as many columns as fit beside the names in the body's width; it prints all rows. When one stretch is
// taller than the body it continues over several pages, split between rows; otherwise as many
// stretches as fit, each followed by a gap, share a page.

#include <QSizeF>
#include <QString>
#include <optional>
#include <utility>
#include <vector>

// A pane pixel on paper: panes print at 96 pixels to the inch.
inline constexpr double kMmPerPixel = 25.4 / 96.0;
inline constexpr double kHeaderBandMm = 10.0;
inline constexpr double kFooterBandMm = 10.0;
// After each stretch that shares a page with others.
inline constexpr double kStretchGapMm = 5.0;

struct CPrintMargins {
    double left = 0;
    double right = 0;
    double top = 0;
    double bottom = 0;
};

// The page setup as printing uses it.
struct CPrintSetup {
    CPrintMargins margins;
    QString header;
    QString footer;
    QSizeF paper;  // millimetres, portrait; empty for the printer's own paper
};

// The stored page setup (lengths in thousandths of an inch, or hundredths of a millimetre when
// `metric`; a paper size of 0 meaning the printer's own) in millimetres.
CPrintSetup PrintSetupFromStored(int marginLeft, int marginRight, int marginTop, int marginBottom,
                                 bool metric, const QString& header, const QString& footer,
                                 int paperWidth = 0, int paperHeight = 0);

struct CRectMm {
    double x = 0;
    double y = 0;
    double width = 0;
    double height = 0;
    bool operator==(const CRectMm&) const = default;
};

struct CPageBands {
    std::optional<CRectMm> header;  // only with a header text
    CRectMm body;
    std::optional<CRectMm> footer;  // only with a footer text
};

// The bands of a page of `page` millimetres; nothing when the margins and bands leave no room.
std::optional<CPageBands> PageBands(QSizeF page, const CPrintSetup& setup);

// What is printed, in millimetres.
struct CRowsMetrics {
    double leftWidth = 0;    // names, position numbers and the gap before the columns
    double columnWidth = 0;  // one display column
    int columnCount = 0;
    std::vector<double> rowHeights;  // the rows in print order
};

// One stretch, or the part of one that a page holds, at `y` below the top of the body.
struct CPrintPiece {
    int firstColumn = 0;
    int endColumn = 0;
    int firstRow = 0;
    int endRow = 0;
    double y = 0;
    bool operator==(const CPrintPiece&) const = default;
};

struct CPrintPlan {
    int columnCount = 0;
    int columnsPerStretch = 0;
    int stretchCount = 0;
    double stretchHeight = 0;
    // The rows of a stretch, page by page: one run when a stretch fits on a page.
    std::vector<std::pair<int, int>> rowRuns;
    int stretchesPerPage = 1;
    int pageCount = 0;

    // The pieces of page `page` (0-based), top to bottom.
    std::vector<CPrintPiece> PiecesOfPage(int page) const;
};

// Lays out the rows in a body of the given size. A stretch holds at least one column, which may
// be cut at the right edge when the names leave no room. No columns make no pages.
CPrintPlan PlanPrint(const CRowsMetrics& rows, double bodyWidth, double bodyHeight);
