#pragma once
// Geometry of the sequence rows: where a display column stands on the screen and which column
// lies under a point, the scale of fit-to-width mode, the widths of the name and number areas,
// the steps of the ruler and the position number a row shows. Plain numbers, no drawing.

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

// The horizontal axis of a sequence area: its left edge, pixels per column, the first visible
// column and the number of columns.
struct CColumnAxis {
    int areaLeft = 0;
    double scale = 0;
    int firstColumn = 0;
    int columnCount = 0;
};

// A range of display columns [start, end).
struct CColumnRange {
    int start = 0;
    int end = 0;
    bool IsEmpty() const { return end <= start; }
    bool operator==(const CColumnRange&) const = default;
};

// The x of the left edge of `column`.
double ColumnLeft(const CColumnAxis& axis, int column);
// The column under `x`, clamped to the columns; -1 when the scale is 0 or less or there are no
// columns.
int ColumnAtX(const CColumnAxis& axis, double x);
// The column boundary nearest to `x` (a caret between columns), 0 .. column count; -1 when the
// scale is 0 or less.
int CaretColumnAtX(const CColumnAxis& axis, double x);
// `x` as a fractional column: the column under it plus how far into the column it lies.
double ColumnCoordinate(const CColumnAxis& axis, double x);
// The columns a band between two fractional columns covers: from the column under the left
// edge to one past the column under the right edge, clamped to the columns.
CColumnRange BandColumns(double fromColumn, double toColumn, int columnCount);

// Pixels per column of fit-to-width mode: all columns in the area less its right margin, never
// below 0, cut (not rounded) to two decimals.
double FitScale(int areaWidth, int rightMargin, int columnCount);
// Whole columns that fit in `areaWidth`; 0 for a scale of 0 or less.
int VisibleColumns(int areaWidth, double scale);
// One past the last column that shows at least in part.
int PaintedColumnEnd(const CColumnAxis& axis, int areaWidth);
// The first column clamped so that the view does not run past the last column.
int ClampFirstColumn(int firstColumn, int columnCount, int visibleColumns);
// The first column after scrolling to show `column`: unchanged when it is visible, otherwise
// five columns before it (clamped).
int FirstColumnToShow(int column, int firstColumn, int visibleColumns, int columnCount);
// -1, 0 or 1: whether `value` lies before, inside or after [low, high).
int OutsideDirection(int value, int low, int high);

// Which edge of a selection [start, end) lies less than half a column from `x` (the middle of
// a selection's first or last column is no longer on its edge).
enum class SelectionEdge { kNone, kStart, kEnd };
SelectionEdge SelectionEdgeAt(const CColumnAxis& axis, double x, CColumnRange selection);

// The name area: the widest name plus 10 pixels, never wider than the window.
int NameAreaWidth(int widestNameWidth, int windowWidth);
// A name cut to `maxLength` characters with "..." appended when it is longer (0: no limit).
std::string ShortenName(std::string_view name, int maxLength);
// The longest start of `name` (whole UTF-8 characters) that, followed by "...", fits `width`
// as `measure` measures text; the whole name when it fits as it is.
std::string ElideName(std::string_view name, int width,
                      const std::function<int(std::string_view)>& measure);

// The text the number area shows for a position number: "(n) ", or for 0 and less (a column
// beyond the row's last residue) a bullet before the absolute value, "(\u2022n) ".
std::string RowPositionText(int positionNumber);
// The widest text the number area must hold: the position text, with its bullet, of
// max(10 x (column count + extra columns), 99).
std::string NumberAreaSample(int columnCount, int extraColumns);

// Label and short-tick steps of the ruler.
struct CRulerSteps {
    int label = 10;
    int shortTick = 1;
};
// The label step grows from `minLabelStep` until two label widths fit between labels; the
// short-tick step is shortTickBase x label / minLabelStep rounded half up, and the label step
// then grows to a multiple of it.
CRulerSteps RulerSteps(double scale, int labelTextWidth, int minLabelStep = 10,
                       int shortTickBase = 1);
enum class RulerMark { kNone, kShortTick, kLabel };
// What the ruler draws at `column` (numbered column + 1): column 1 and every multiple of the
// label step are labelled, other multiples of the short-tick step get a short tick.
RulerMark RulerMarkAt(int column, const CRulerSteps& steps);
