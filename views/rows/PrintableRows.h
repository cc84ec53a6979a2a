#pragma once
// What printing, print preview and figure export ask of a pane that shows rows of sequences.
//
// The pane paints through the same routine on the screen, a QPrinter, a QPdfWriter, a
// QSvgGenerator or a QImage. All sizes are logical pixels of the pane's own fonts (fonts are set
// by pixel size), so a caller that works in millimetres scales the painter
// (painter.scale(unitsPerPixel, unitsPerPixel)) and asks for sizes in pixels.
//
// A page is laid out as
//
//     +-----------+---------+---------------------------------------+
//     | name area | numbers | columns firstColumn .. endColumn - 1  |   top rows (the ruler)
//     |           |         |                                       |   molecule rows
//     +-----------+---------+---------------------------------------+
//     <-------- LeftWidth --><-- ColumnWidth x (endColumn - first) -->
//
// and the rows firstRow .. endRow - 1 of the print order (top group, middle group, bottom group;
// separators and fillers are not printed) are stacked downwards from the origin.
//
// Typical use by a printer:
//     const CRowPrintOptions options{.printing = true};
//     const int perStretch = int((pageWidthPx - rows.LeftWidth(options)) /
//                                rows.ColumnWidth(options));
//     for each stretch [c, c + perStretch) and each run of rows [r0, r1) that fits the height:
//         rows.PaintRange(painter, origin, c, min(c + perStretch, rows.ColumnCount()), r0, r1,
//                         options);
// A pane without a window (tiler-blocks --export) is made, given a document, updated with
// OnUpdate(nullptr, kHintAll) and asked through CPaneView::PrintableRows().

#include <QPoint>
#include <QSize>

class QPainter;

struct CRowPrintOptions {
    // White behind uncoloured cells (instead of the window colour); the ruler writes the first
    // and last column numbers of the range at its two ends; no selection, focus or current row.
    bool printing = true;
    // Pixels per display column; 0 takes the pane's own (character cell) width. A width other
    // than the character cell draws every residue on its own (text per character).
    double columnWidth = 0;
    // Draws every residue as a text item of its own (one SVG text element per character) even
    // when whole runs could be drawn at once.
    bool textPerCharacter = false;
};

class IPrintableRows {
  public:
    virtual ~IPrintableRows() = default;

    // Display columns of the longest row; 0 when there is nothing to draw.
    virtual int ColumnCount() const = 0;
    // Rows in print order (ruler first, then one per molecule).
    virtual int PrintRowCount() const = 0;
    virtual int PrintRowHeight(int row, const CRowPrintOptions& options) const = 0;
    // Width of the name area plus the number area.
    virtual int LeftWidth(const CRowPrintOptions& options) const = 0;
    // Pixels per display column.
    virtual double ColumnWidth(const CRowPrintOptions& options) const = 0;
    // The size PaintRange covers for that range of columns and rows.
    virtual QSize ContentSize(int firstColumn, int endColumn, int firstRow, int endRow,
                              const CRowPrintOptions& options) const = 0;
    // Draws names, position numbers, ruler and residues of columns [firstColumn, endColumn) and
    // print rows [firstRow, endRow) with the top left corner at `origin`. Ranges are clamped.
    virtual void PaintRange(QPainter& painter, QPoint origin, int firstColumn, int endColumn,
                            int firstRow, int endRow, const CRowPrintOptions& options) const = 0;
};
