#include "layout/RowGeometry.h"

#include <algorithm>
#include <cmath>

double ColumnLeft(const CColumnAxis& axis, int column) {
    return (column - axis.firstColumn) * axis.scale + axis.areaLeft;
}

double ColumnCoordinate(const CColumnAxis& axis, double x) {
    if (axis.scale <= 0)
        return -1;
    return (x - axis.areaLeft) / axis.scale + axis.firstColumn;
}

int ColumnAtX(const CColumnAxis& axis, double x) {
    if (axis.scale <= 0 || axis.columnCount <= 0)
        return -1;
    const double column = std::floor(ColumnCoordinate(axis, x));
    return static_cast<int>(std::clamp(column, 0.0, axis.columnCount - 1.0));
}

int CaretColumnAtX(const CColumnAxis& axis, double x) {
    if (axis.scale <= 0)
        return -1;
    // More than half a column to the right of a boundary goes to the next one.
    const double column = std::ceil(ColumnCoordinate(axis, x) - 0.5);
    return static_cast<int>(std::clamp(column, 0.0, static_cast<double>(axis.columnCount)));
}

CColumnRange BandColumns(double fromColumn, double toColumn, int columnCount) {
    if (columnCount <= 0)
        return {};
    auto column = [columnCount](double c) {
        return static_cast<int>(std::clamp(std::floor(c), 0.0, columnCount - 1.0));
    };
    const int first = column(std::min(fromColumn, toColumn));
    const int last = column(std::max(fromColumn, toColumn));
    return {first, last + 1};
}

double FitScale(int areaWidth, int rightMargin, int columnCount) {
    const long long room = static_cast<long long>(areaWidth) - rightMargin;
    if (columnCount <= 0 || room <= 0)
        return 0;
    // In whole hundredths, so that a quotient such as 0.29 is not cut to 0.28 by rounding.
    return static_cast<double>(room * 100 / columnCount) / 100.0;
}

int VisibleColumns(int areaWidth, double scale) {
    if (scale <= 0 || areaWidth <= 0)
        return 0;
    return static_cast<int>(std::min(areaWidth / scale, 2e9));
}

int PaintedColumnEnd(const CColumnAxis& axis, int areaWidth) {
    if (axis.scale <= 0 || areaWidth <= 0)
        return axis.firstColumn;
    const double end = std::ceil(axis.firstColumn + areaWidth / axis.scale);
    return static_cast<int>(std::clamp(end, static_cast<double>(axis.firstColumn),
                                       static_cast<double>(std::max(axis.columnCount, 0))));
}

int ClampFirstColumn(int firstColumn, int columnCount, int visibleColumns) {
    return std::clamp(firstColumn, 0, std::max(0, columnCount - std::max(visibleColumns, 0)));
}

int FirstColumnToShow(int column, int firstColumn, int visibleColumns, int columnCount) {
    if (column >= firstColumn && column < firstColumn + visibleColumns)
        return firstColumn;
    return ClampFirstColumn(column - 5, columnCount, visibleColumns);
}

int OutsideDirection(int value, int low, int high) {
    if (value < low)
        return -1;
    return value >= high ? 1 : 0;
}

SelectionEdge SelectionEdgeAt(const CColumnAxis& axis, double x, CColumnRange selection) {
    if (axis.scale <= 0 || selection.IsEmpty())
        return SelectionEdge::kNone;
    const double toStart = std::abs(x - ColumnLeft(axis, selection.start));
    const double toEnd = std::abs(x - ColumnLeft(axis, selection.end));
    const double reach = axis.scale / 2;
    if (toStart >= reach && toEnd >= reach)
        return SelectionEdge::kNone;
    return toStart <= toEnd ? SelectionEdge::kStart : SelectionEdge::kEnd;
}

int NameAreaWidth(int widestNameWidth, int windowWidth) {
    return std::clamp(widestNameWidth + 10, 0, std::max(windowWidth, 0));
}

namespace {

bool IsContinuationByte(char c) {
    return (static_cast<unsigned char>(c) & 0xC0) == 0x80;
}

// The byte length of the first `count` UTF-8 characters of `text` (all of it when shorter).
std::size_t PrefixBytes(std::string_view text, std::size_t count) {
    std::size_t bytes = 0;
    for (std::size_t seen = 0; bytes < text.size(); ++bytes) {
        if (!IsContinuationByte(text[bytes]) && seen++ == count)
            break;
    }
    return bytes;
}

std::size_t CharacterCount(std::string_view text) {
    return static_cast<std::size_t>(
        std::count_if(text.begin(), text.end(), [](char c) { return !IsContinuationByte(c); }));
}

}  // namespace

std::string ShortenName(std::string_view name, int maxLength) {
    if (maxLength <= 0 || CharacterCount(name) <= static_cast<std::size_t>(maxLength))
        return std::string(name);
    return std::string(name.substr(0, PrefixBytes(name, maxLength))) + "...";
}

std::string ElideName(std::string_view name, int width,
                      const std::function<int(std::string_view)>& measure) {
    if (measure(name) <= width)
        return std::string(name);
    // The fitting prefix lengths form a run from 0: search for its end.
    std::size_t low = 0;
    std::size_t high = CharacterCount(name);
    auto elided = [name](std::size_t count) {
        return std::string(name.substr(0, PrefixBytes(name, count))) + "...";
    };
    while (low < high) {
        const std::size_t middle = (low + high + 1) / 2;
        if (measure(elided(middle)) <= width)
            low = middle;
        else
            high = middle - 1;
    }
    return elided(low);
}

std::string RowPositionText(int positionNumber) {
    if (positionNumber > 0)
        return "(" + std::to_string(positionNumber) + ") ";
    return "(\u2022" + std::to_string(-static_cast<long long>(positionNumber)) + ") ";
}

std::string NumberAreaSample(int columnCount, int extraColumns) {
    const long long widest =
        std::max(10LL * (static_cast<long long>(columnCount) + extraColumns), 99LL);
    return "(\u2022" + std::to_string(widest) + ") ";
}

CRulerSteps RulerSteps(double scale, int labelTextWidth, int minLabelStep, int shortTickBase) {
    CRulerSteps steps;
    minLabelStep = std::max(minLabelStep, 1);
    steps.label = minLabelStep;
    if (scale > 0) {
        // Jump close to the answer, then step as the plain rule does.
        const double needed = 2.0 * labelTextWidth / scale;
        if (needed > steps.label + 1)
            steps.label = static_cast<int>(std::min(needed, 1e9)) - 1;
        while (steps.label * scale < 2.0 * labelTextWidth)
            ++steps.label;
    }
    // base x label / minimum, halves rounded up.
    const long long twice = 2LL * shortTickBase * steps.label;
    steps.shortTick = std::max(1, static_cast<int>((twice + minLabelStep) / (2LL * minLabelStep)));
    while (steps.label % steps.shortTick != 0)
        ++steps.label;
    return steps;
}

RulerMark RulerMarkAt(int column, const CRulerSteps& steps) {
    const int number = column + 1;
    if (number == 1 || (number > 1 && number % steps.label == 0))
        return RulerMark::kLabel;
    if (number % steps.shortTick == 0)
        return RulerMark::kShortTick;
    return RulerMark::kNone;
}
