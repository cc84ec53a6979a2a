#pragma once
// Figures of a pane drawn without a window, for papers and scripts: the pane's rows painted by
// the routine that paints the screen and the printer into an SVG, PNG or PDF file, chosen by
// the file's extension. In SVG every residue stays a text element at its row and column.

#include <QString>
#include <optional>

#include "rows/PrintableRows.h"

enum class FigureFormat { svg, png, pdf };

// The format of a file name's extension (case-insensitive); nothing, with `error` when given,
// for any other extension.
std::optional<FigureFormat> FigureFormatOf(const QString& path, QString* error = nullptr);

struct CFigureOptions {
    int width = 0;        // the figure's width in pixels; 0 keeps the pane's own size
    int firstColumn = 0;  // display columns [firstColumn, endColumn), 0-based
    int endColumn = -1;   // -1: to the last column
};

// Exit statuses of figure export.
enum FigureStatus : int { kFigureDone = 0, kFigureNothingToDraw = 1, kFigureFailed = 2 };

// Draws the rows into `path` through a temporary file that replaces it only when complete.
// Returns kFigureDone, kFigureNothingToDraw (no columns or rows in the range) or kFigureFailed
// (unknown extension, a figure too large, a file that cannot be written), with `error`.
int WriteFigure(const IPrintableRows& rows, const QString& path, const CFigureOptions& options,
                QString& error);
