#include "rows/RulerWnd.h"

#include <QFontMetrics>
#include <QPainter>
#include <QPalette>
#include <algorithm>

#include "StoredColour.h"

CRulerWnd::CRulerWnd(QString name, std::uint32_t background, int longTick, int shortTick)
    : CScrollWnd(std::move(name)),
      m_background(background),
      m_longTick(longTick),
      m_shortTick(shortTick),
      m_font(QStringLiteral("Helvetica")) {
    m_font.setStyleHint(QFont::SansSerif);
    m_font.setPixelSize(10);
    SetGroup(RowGroup::kTop);
    SetRowHeight(16);
}

CRulerSteps CRulerWnd::Steps(double scale) const {
    const int widest = QFontMetrics(m_font).horizontalAdvance(QString::number(m_columns - 1));
    return RulerSteps(scale, widest, kMinLabelStep, kShortTickBase);
}

void CRulerWnd::PaintCells(QPainter& painter, const CRowPaintContext& context) const {
    const double scale = context.axis.scale;
    const int end = std::min(context.endColumn, m_columns);
    const double right = ColumnLeft(context.axis, std::max(end, context.firstColumn));
    const double bottom = context.top + context.height - 1;
    painter.fillRect(
        QRectF(context.axis.areaLeft, context.top, right - context.axis.areaLeft, context.height),
        StoredColour(m_background, context.emptyBackground));
    if (scale <= 0 || context.firstColumn >= end)
        return;
    painter.setFont(m_font);
    const CRulerSteps steps = Steps(scale);
    const QColor line = StoredColour(kLineColour, Qt::darkGreen);
    for (int column = context.firstColumn; column < end; ++column) {
        const RulerMark mark = RulerMarkAt(column, steps);
        if (mark == RulerMark::kNone)
            continue;
        const double x = ColumnLeft(context.axis, column) + scale / 2;
        const int tick = mark == RulerMark::kLabel ? m_longTick : m_shortTick;
        painter.setPen(line);
        painter.drawLine(QPointF(x, bottom - tick), QPointF(x, bottom));
        if (mark == RulerMark::kLabel && !context.printing)
            PaintLabel(painter, context, x, column + 1, Qt::AlignHCenter);
    }
    if (context.printing) {
        // On paper the stretch is numbered at its two ends.
        PaintLabel(painter, context, context.axis.areaLeft, context.firstColumn + 1, Qt::AlignLeft);
        PaintLabel(painter, context, right, end, Qt::AlignRight);
    }
    painter.setPen(line);
    painter.drawLine(QPointF(context.axis.areaLeft, bottom), QPointF(right - 1, bottom));
}

void CRulerWnd::PaintLabel(QPainter& painter, const CRowPaintContext& context, double x, int number,
                           Qt::Alignment side) const {
    const QString text = QString::number(number);
    const double width = QFontMetricsF(m_font).horizontalAdvance(text);
    const double left = side == Qt::AlignLeft    ? x
                        : side == Qt::AlignRight ? x - width
                                                 : x - width / 2;
    painter.setPen(StoredColour(kTextColour, Qt::darkBlue));
    painter.drawText(QPointF(left, context.top + context.height - 1 - m_longTick - 1), text);
}
