#include "rows/ScrollWnd.h"

#include <QPainter>
#include <QPalette>
#include <atomic>

namespace {

int NextRowIdentifier() {
    static std::atomic<int> counter{0};
    return ++counter;
}

}  // namespace

CScrollWnd::CScrollWnd(QString name, std::uint32_t ownerData)
    : m_name(std::move(name)), m_ownerData(ownerData), m_identifier(NextRowIdentifier()) {}

CSepWnd::CSepWnd(QString name) : CScrollWnd(std::move(name)) {
    SetRowHeight(2);
}

void CSepWnd::PaintCells(QPainter& painter, const CRowPaintContext& context) const {
    const double right =
        context.axis.areaLeft + (context.endColumn - context.firstColumn) * context.axis.scale;
    painter.setPen(context.palette->color(QPalette::Mid));
    painter.drawLine(QPointF(0, context.top), QPointF(right - 1, context.top));
}
