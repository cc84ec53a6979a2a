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

CCellStyle CTextWnd::CellStyle(int, const CRowPaintContext& context) const {
    return {context.palette->color(QPalette::Text), context.emptyBackground};
}

void CTextWnd::PaintCells(QPainter& painter, const CRowPaintContext& context) const {
    const int end = std::min(context.endColumn, ColumnCount());
    if (context.axis.scale <= 0 || context.firstColumn >= end)
        return;
    painter.setFont(m_font);
    const bool wholeRuns = !context.textPerCharacter && context.axis.scale == m_cellWidth;
    int first = std::max(context.firstColumn, 0);
    CCellStyle style = CellStyle(first, context);
    for (int column = first + 1; column <= end; ++column) {
        CCellStyle next;
        if (column < end) {
            next = CellStyle(column, context);
            if (next == style)
                continue;
        }
        PaintRun(painter, context, first, column, style, wholeRuns);
        first = column;
        style = next;
    }
}

void CTextWnd::PaintRun(QPainter& painter, const CRowPaintContext& context, int first, int end,
                        const CCellStyle& style, bool wholeRun) const {
    const double scale = context.axis.scale;
    const double left = ColumnLeft(context.axis, first);
    painter.fillRect(QRectF(left, context.top, (end - first) * scale, context.height),
                     style.background);
    // Characters squeezed below half their width are unreadable: colour only.
    if (scale * 2 < m_cellWidth)
        return;
    painter.setPen(style.text);
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
