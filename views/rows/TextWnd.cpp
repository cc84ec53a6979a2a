#include "rows/TextWnd.h"

#include <QFontMetricsF>
#include <QPainter>
#include <QPalette>
#include <algorithm>
#include <cmath>

CTextWnd::CTextWnd(QString name, std::string text, std::uint32_t ownerData)
    : CScrollWnd(std::move(name), ownerData), m_text(std::move(text)) {
    SetFont(DefaultFont());
}

QFont CTextWnd::DefaultFont() {
    QFont font(QStringLiteral("Courier New"));
    font.setStyleHint(QFont::TypeWriter);
    font.setFixedPitch(true);
    font.setPixelSize(16);
    font.setWeight(QFont::Normal);
    return font;
}

void CTextWnd::SetFont(const QFont& font) {
    m_font = font;
    m_font.setLetterSpacing(QFont::AbsoluteSpacing, 0);
    const QFontMetricsF metrics(m_font);
    const double advance = metrics.horizontalAdvance(QLatin1Char('M'));
    m_cellWidth = std::max(1, static_cast<int>(std::lround(advance)));
    // Whole-pixel cells: a run of text then puts every character in its own cell.
    m_font.setLetterSpacing(QFont::AbsoluteSpacing, m_cellWidth - advance);
    m_textHeight = static_cast<int>(std::ceil(metrics.height()));
    m_ascent = static_cast<int>(std::lround(metrics.ascent()));
}

char CTextWnd::CharAt(int column) const {
    if (column < 0 || column >= static_cast<int>(m_text.size()))
        return ' ';
    return m_text[column];
}

QString CTextWnd::TextInColumns(int first, int end) const {
    const int size = static_cast<int>(m_text.size());
    first = std::clamp(first, 0, size);
    end = std::clamp(end, first, size);
    return QString::fromLatin1(m_text.data() + first, end - first);
}

QColor CTextWnd::TextColourAt(int, const CRowPaintContext& context) const {
    return context.palette->color(QPalette::Text);
}

QColor CTextWnd::BackgroundAt(int, const CRowPaintContext& context) const {
    return context.emptyBackground;
}

namespace {

// Calls paint(first, end, value) for every run of columns in [first, end) whose valueOf is the
// same.
template <class ValueOf, class Paint>
void ForEachRun(int first, int end, ValueOf valueOf, Paint paint) {
    if (first >= end)
        return;
    auto value = valueOf(first);
    for (int column = first + 1; column < end; ++column) {
        auto next = valueOf(column);
        if (next == value)
            continue;
        paint(first, column, value);
        first = column;
        value = next;
    }
    paint(first, end, value);
}

}  // namespace

void CTextWnd::PaintCells(QPainter& painter, const CRowPaintContext& context) const {
    const int first = std::max(context.firstColumn, 0);
    const int end = std::min(context.endColumn, ColumnCount());
    const double scale = context.axis.scale;
    if (scale <= 0 || first >= end)
        return;
    // Backgrounds first, then the text over them in runs of one colour: block colours change
    // often along a row, text colours seldom.
    ForEachRun(
        first, end, [&](int column) { return BackgroundAt(column, context); },
        [&](int from, int to, const QColor& background) {
            const double left = ColumnLeft(context.axis, from);
            painter.fillRect(QRectF(left, context.top, (to - from) * scale, context.height),
                             background);
        });
    // Characters squeezed below half their width are unreadable: colour only.
    if (scale * 2 < m_cellWidth)
        return;
    painter.setFont(m_font);
    const bool wholeRuns = !context.textPerCharacter && scale == m_cellWidth;
    ForEachRun(
        first, end, [&](int column) { return TextColourAt(column, context); },
        [&](int from, int to, const QColor& text) {
            painter.setPen(text);
            PaintText(painter, context, from, to, wholeRuns);
        });
}

void CTextWnd::PaintText(QPainter& painter, const CRowPaintContext& context, int first, int end,
                         bool wholeRun) const {
    const double scale = context.axis.scale;
    const double left = ColumnLeft(context.axis, first);
    const double baseline = context.top + (context.height - m_textHeight) / 2.0 + m_ascent;
    if (wholeRun) {
        painter.drawText(QPointF(left, baseline),
                         QString::fromLatin1(m_text.data() + first, end - first));
        return;
    }
    const double inset = (scale - m_cellWidth) / 2;
    for (int column = first; column < end; ++column) {
        painter.drawText(QPointF(left + (column - first) * scale + inset, baseline),
                         QString(QLatin1Char(m_text[column])));
    }
}
