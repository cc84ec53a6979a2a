#include "rows/TilxCtrl.h"

#include <QApplication>
#include <QFontMetrics>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>
#include <QScrollBar>
#include <QToolTip>
#include <algorithm>
#include <cmath>

namespace {

constexpr int kFitRightMargin = 4;
constexpr int kAutoScrollInterval = 60;  // milliseconds between automatic scroll steps
constexpr int kPrintGap = 5;             // between the left areas and the columns on paper
// Names on paper are cut to this width at most: a very long name must leave room for columns.
constexpr int kMaxPrintedNameWidth = 320;

bool IsCtrl(Qt::KeyboardModifiers modifiers) {
    return modifiers & Qt::ControlModifier;
}

bool IsShift(Qt::KeyboardModifiers modifiers) {
    return modifiers & Qt::ShiftModifier;
}

CColumnRange Ordered(int a, int b) {
    return {std::min(a, b), std::max(a, b)};
}

// Clamps [first, end) into [0, count).
void ClampRange(int& first, int& end, int count) {
    first = std::clamp(first, 0, count);
    end = std::clamp(end, first, count);
}

}  // namespace

CTilxCtrl::CTilxCtrl(QWidget* parent)
    : QAbstractScrollArea(parent),
      m_sepTop(QStringLiteral("SepTopWnd")),
      m_sepBottom(QStringLiteral("SepBottomWnd")),
      m_nameFont(QStringLiteral("MS Sans Serif")) {
    setObjectName(QStringLiteral("TilxCtrl"));
    m_nameFont.setStyleHint(QFont::SansSerif);
    m_nameFont.setPixelSize(14);
    setFocusPolicy(Qt::StrongFocus);
    viewport()->setMouseTracking(true);
    viewport()->setAutoFillBackground(false);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAsNeeded);
    setVerticalScrollBarPolicy(Qt::ScrollBarAsNeeded);
    m_autoScroll.setInterval(kAutoScrollInterval);
    connect(&m_autoScroll, &QTimer::timeout, this, &CTilxCtrl::AutoScrollTick);
}

CTilxCtrl::~CTilxCtrl() = default;

CScrollWnd* CTilxCtrl::AddRow(std::unique_ptr<CScrollWnd> row) {
    // Keep the groups in order: top rows, middle rows, bottom rows.
    const RowGroup group = row->Group();
    auto after = std::find_if(m_rows.begin(), m_rows.end(), [group](const auto& r) {
        return static_cast<int>(r->Group()) > static_cast<int>(group);
    });
    CScrollWnd* added = row.get();
    const int index = static_cast<int>(after - m_rows.begin());
    m_rows.insert(after, std::move(row));
    if (m_currentRow >= index)
        ++m_currentRow;
    return added;
}

void CTilxCtrl::RemoveAllRows() {
    m_rows.clear();
    m_placements.clear();
    m_currentRow = -1;
    m_firstRow = 0;
    m_drag = Drag::kNone;
    m_autoScroll.stop();
}

CScrollWnd* CTilxCtrl::RowAt(int index) const {
    return index >= 0 && index < RowCount() ? m_rows[index].get() : nullptr;
}

int CTilxCtrl::IndexOfRow(const QString& name) const {
    auto it = std::find_if(m_rows.begin(), m_rows.end(),
                           [&name](const auto& row) { return row->Name() == name; });
    return it == m_rows.end() ? -1 : static_cast<int>(it - m_rows.begin());
}

int CTilxCtrl::FirstMiddleIndex() const {
    return static_cast<int>(std::count_if(m_rows.begin(), m_rows.end(), [](const auto& row) {
        return row->Group() == RowGroup::kTop;
    }));
}

int CTilxCtrl::MiddleRowCount() const {
    return static_cast<int>(std::count_if(m_rows.begin(), m_rows.end(), [](const auto& row) {
        return row->Group() == RowGroup::kMiddle;
    }));
}

bool CTilxCtrl::MoveRow(int from, int before) {
    const int first = FirstMiddleIndex();
    const int end = first + MiddleRowCount();
    if (from < first || from >= end || before < first || before > end || before == from ||
        before == from + 1) {
        return false;
    }
    const CScrollWnd* current = RowAt(m_currentRow);
    auto row = std::move(m_rows[from]);
    m_rows.erase(m_rows.begin() + from);
    const int to = before > from ? before - 1 : before;
    m_rows.insert(m_rows.begin() + to, std::move(row));
    for (int i = 0; i < RowCount(); ++i) {
        if (m_rows[i].get() == current)
            m_currentRow = i;
    }
    UpdatePlacements();
    viewport()->update();
    emit rowMoved(from, to);
    return true;
}

void CTilxCtrl::SetFlags(const Flags& flags) {
    m_flags = flags;
    Relayout();
}

void CTilxCtrl::SetMaxNameLength(int length) {
    m_maxNameLength = std::max(length, 0);
    Relayout();
}

void CTilxCtrl::SetExtraColumns(int columns) {
    m_extraColumns = std::max(columns, 0);
    Relayout();
}

int CTilxCtrl::WidestNameWidth() const {
    const QFontMetrics metrics(m_nameFont);
    int widest = 0;
    for (const auto& row : m_rows) {
        if (!row->ShowsName())
            continue;
        const std::string name = ShortenName(row->Name().toStdString(), m_maxNameLength);
        widest = std::max(widest, metrics.horizontalAdvance(QString::fromStdString(name)));
    }
    return widest;
}

int CTilxCtrl::NumberAreaWidth() const {
    const QString sample = QString::fromStdString(NumberAreaSample(m_columnCount, m_extraColumns));
    return QFontMetrics(m_nameFont).horizontalAdvance(sample) + 2;
}

double CTilxCtrl::CharacterScale() const {
    double scale = 0;
    for (const auto& row : m_rows)
        scale = std::max(scale, row->PreferredColumnWidth());
    return scale;
}

void CTilxCtrl::Relayout() {
    m_columnCount = 0;
    for (const auto& row : m_rows)
        m_columnCount = std::max(m_columnCount, row->ColumnCount());
    m_widestName = m_flags.showNames ? WidestNameWidth() : 0;
    const int width = std::max(viewport()->width(), 0);
    const int height = std::max(viewport()->height(), 0);
    const int nameWidth = m_flags.showNames ? NameAreaWidth(m_widestName, width) : 0;
    const int numberWidth =
        m_flags.showNumbers ? std::clamp(NumberAreaWidth(), 0, width - nameWidth) : 0;
    m_nameArea = QRect(0, 0, nameWidth, height);
    m_numberArea = QRect(nameWidth, 0, numberWidth, height);
    m_sequenceArea = QRect(nameWidth + numberWidth, 0, width - nameWidth - numberWidth, height);
    m_scale = m_flags.fitToWidth ? FitScale(m_sequenceArea.width(), kFitRightMargin, m_columnCount)
                                 : CharacterScale();
    UpdateScrollBars();
    UpdatePlacements();
    viewport()->update();
}

int CTilxCtrl::MaxFirstRow() const {
    int fixed = 0;
    for (const auto& row : m_rows) {
        if (row->Group() != RowGroup::kMiddle)
            fixed += row->RowHeight();
    }
    const int room = viewport()->height() - fixed - m_sepTop.RowHeight() - m_sepBottom.RowHeight();
    // Count the middle rows that fit from the end.
    const int first = FirstMiddleIndex();
    int index = first + MiddleRowCount();
    for (int used = 0; index > first; --index) {
        used += m_rows[index - 1]->RowHeight();
        if (used > room)
            break;
    }
    return index - first;
}

void CTilxCtrl::UpdateScrollBars() {
    const int visible = VisibleColumnCount();
    QScrollBar* horizontal = horizontalScrollBar();
    const int maxColumn = m_scale > 0 ? std::max(0, m_columnCount - visible) : 0;
    horizontal->setRange(0, maxColumn);
    horizontal->setPageStep(std::max(visible, 1));
    horizontal->setSingleStep(1);
    m_firstColumn = std::clamp(m_firstColumn, 0, maxColumn);
    QScrollBar* vertical = verticalScrollBar();
    const int maxRow = MaxFirstRow();
    vertical->setRange(0, maxRow);
    vertical->setPageStep(std::max(1, MiddleRowCount() - maxRow));
    m_firstRow = std::clamp(m_firstRow, 0, maxRow);
}

void CTilxCtrl::UpdatePlacements() {
    m_placements.clear();
    const int height = viewport()->height();
    int y = 0;
    int index = 0;
    for (; index < RowCount() && m_rows[index]->Group() == RowGroup::kTop; ++index) {
        m_placements.push_back({m_rows[index].get(), index, y, m_rows[index]->RowHeight()});
        y += m_rows[index]->RowHeight();
    }
    if (index > 0) {
        m_placements.push_back({&m_sepTop, -1, y, m_sepTop.RowHeight()});
        y += m_sepTop.RowHeight();
    }
    int bottomHeight = 0;
    const int middleEnd = index + MiddleRowCount();
    for (int i = middleEnd; i < RowCount(); ++i)
        bottomHeight += m_rows[i]->RowHeight();
    const int middleBottom =
        height - bottomHeight - (middleEnd < RowCount() ? m_sepBottom.RowHeight() : 0);
    for (int i = index + m_firstRow; i < middleEnd && y < middleBottom; ++i) {
        m_placements.push_back({m_rows[i].get(), i, y, m_rows[i]->RowHeight()});
        y += m_rows[i]->RowHeight();
    }
    if (middleEnd < RowCount()) {
        y = std::max(y, middleBottom);
        m_placements.push_back({&m_sepBottom, -1, y, m_sepBottom.RowHeight()});
        y += m_sepBottom.RowHeight();
        for (int i = middleEnd; i < RowCount(); ++i) {
            m_placements.push_back({m_rows[i].get(), i, y, m_rows[i]->RowHeight()});
            y += m_rows[i]->RowHeight();
        }
    }
}

std::optional<QRect> CTilxCtrl::RowRect(int index) const {
    for (const Placement& p : m_placements) {
        if (p.index == index && index >= 0)
            return QRect(0, p.top, viewport()->width(), p.height);
    }
    return std::nullopt;
}

int CTilxCtrl::RowAtY(int y) const {
    for (const Placement& p : m_placements) {
        if (p.index >= 0 && y >= p.top && y < p.top + p.height)
            return p.index;
    }
    return -1;
}

void CTilxCtrl::ScrollToColumn(int column) {
    horizontalScrollBar()->setValue(ClampFirstColumn(column, m_columnCount, VisibleColumnCount()));
}

void CTilxCtrl::ScrollToShowColumn(int column) {
    ScrollToColumn(FirstColumnToShow(column, m_firstColumn, VisibleColumnCount(), m_columnCount));
}

void CTilxCtrl::ScrollToRow(int middleIndex) {
    verticalScrollBar()->setValue(middleIndex);
}

void CTilxCtrl::scrollContentsBy(int, int) {
    const int column = horizontalScrollBar()->value();
    const int row = verticalScrollBar()->value();
    const bool columnsMoved = column != m_firstColumn;
    const bool rowsMoved = row != m_firstRow;
    m_firstColumn = column;
    m_firstRow = row;
    UpdatePlacements();
    viewport()->update();
    if (columnsMoved)
        emit columnsScrolled(column);
    if (rowsMoved)
        emit rowsScrolled(row);
}

void CTilxCtrl::resizeEvent(QResizeEvent* event) {
    QAbstractScrollArea::resizeEvent(event);
    Relayout();
}

void CTilxCtrl::SetCurrentRow(int index) {
    if (index == m_currentRow || (index >= 0 && !RowAt(index)))
        return;
    m_currentRow = index;
    const int middle = index - FirstMiddleIndex();
    if (middle >= 0 && middle < m_firstRow)
        ScrollToRow(middle);
    // Below the shown rows: scroll down until it shows.
    for (int first = m_firstRow + 1; middle >= 0 && !RowRect(index) && first <= MaxFirstRow();
         ++first) {
        ScrollToRow(first);
    }
    viewport()->update();
    emit currentRowChanged(index);
}

void CTilxCtrl::SetRowSelection(int index, CColumnRange range) {
    if (CScrollWnd* row = RowAt(index)) {
        row->SetSelection(range);
        viewport()->update();
    }
}

void CTilxCtrl::ClearSelection() {
    for (auto& row : m_rows)
        row->ClearSelection();
    viewport()->update();
    emit selectionCleared();
}

void CTilxCtrl::SetRowSelected(int index, bool selected) {
    CScrollWnd* row = RowAt(index);
    if (!row || row->IsSelected() == selected)
        return;
    row->SetSelected(selected);
    viewport()->update();
    emit rowSelectedChanged(index, selected);
}

// Painting.

void CTilxCtrl::paintEvent(QPaintEvent*) {
    QPainter painter(viewport());
    const QColor window = palette().color(QPalette::Base);
    painter.fillRect(viewport()->rect(), window);
    RowFrame frame;
    frame.nameWidth = m_nameArea.width();
    frame.numberWidth = m_numberArea.width();
    frame.axis = Axis();
    frame.endColumn = PaintedColumnEnd(frame.axis, m_sequenceArea.width());
    frame.emptyBackground = window;
    for (const Placement& p : m_placements) {
        frame.top = p.top;
        frame.height = p.height;
        frame.selected = p.row->IsSelected();
        frame.current = p.index >= 0 && p.index == m_currentRow && hasFocus();
        PaintRow(painter, *p.row, frame);
    }
    PaintSelections(painter);
    PaintBand(painter);
}

void CTilxCtrl::PaintRow(QPainter& painter, const CScrollWnd& row, const RowFrame& frame) const {
    painter.save();
    if (frame.nameWidth > 0)
        PaintName(painter, row, frame);
    if (frame.numberWidth > 0)
        PaintNumber(painter, row, frame);
    const double cellsWidth = (frame.endColumn - frame.axis.firstColumn) * frame.axis.scale;
    // A separator line also crosses the names.
    const double clipLeft = row.ShowsName() || row.IsPrintable() ? frame.axis.areaLeft : 0;
    painter.setClipRect(
        QRectF(clipLeft, frame.top, frame.axis.areaLeft - clipLeft + cellsWidth, frame.height));
    CRowPaintContext context;
    context.axis = frame.axis;
    context.firstColumn = frame.axis.firstColumn;
    context.endColumn = frame.endColumn;
    context.top = frame.top;
    context.height = frame.height;
    context.printing = frame.printing;
    context.textPerCharacter = frame.textPerCharacter;
    context.palette = &palette();
    context.emptyBackground = frame.emptyBackground;
    row.PaintCells(painter, context);
    painter.restore();
}

void CTilxCtrl::PaintName(QPainter& painter, const CScrollWnd& row, const RowFrame& frame) const {
    if (!row.ShowsName())
        return;
    const QRect area(0, frame.top, frame.nameWidth, frame.height);
    const bool highlighted = frame.selected && !frame.printing;
    painter.fillRect(area,
                     highlighted ? palette().color(QPalette::Highlight) : frame.emptyBackground);
    painter.setPen(palette().color(highlighted ? QPalette::HighlightedText : QPalette::Text));
    painter.setFont(m_nameFont);
    const QFontMetrics metrics(m_nameFont);
    const std::string shortened = ShortenName(row.Name().toStdString(), m_maxNameLength);
    const std::string shown =
        ElideName(shortened, frame.nameWidth - 5, [&metrics](std::string_view text) {
            return metrics.horizontalAdvance(
                QString::fromUtf8(text.data(), static_cast<int>(text.size())));
        });
    painter.setClipRect(area);
    painter.drawText(area.adjusted(2, 0, 0, 0), Qt::AlignLeft | Qt::AlignVCenter,
                     QString::fromStdString(shown));
    if (frame.current) {
        painter.setPen(QPen(palette().color(QPalette::Text), 1, Qt::DotLine));
        painter.drawRect(area.adjusted(0, 0, -1, -1));
    }
    painter.setClipping(false);
}

void CTilxCtrl::PaintNumber(QPainter& painter, const CScrollWnd& row, const RowFrame& frame) const {
    const std::optional<int> number = row.PositionNumber(frame.axis.firstColumn);
    if (!number)
        return;
    const QRect area(frame.nameWidth, frame.top, frame.numberWidth, frame.height);
    painter.setClipRect(area);
    painter.setFont(m_nameFont);
    painter.setPen(palette().color(QPalette::Text));
    painter.drawText(area, Qt::AlignLeft | Qt::AlignVCenter,
                     QString::fromStdString(RowPositionText(*number)));
    painter.setClipping(false);
}

void CTilxCtrl::PaintSelections(QPainter& painter) const {
    const CColumnAxis axis = Axis();
    const int end = PaintedColumnEnd(axis, m_sequenceArea.width());
    painter.save();
    painter.setClipRect(m_sequenceArea);
    painter.setCompositionMode(QPainter::RasterOp_SourceXorDestination);
    for (const Placement& p : m_placements) {
        const CColumnRange range = p.row->Selection();
        const int first = std::max(range.start, m_firstColumn);
        const int last = std::min(range.end, end);
        if (p.index < 0 || first >= last)
            continue;
        const double left = ColumnLeft(axis, first);
        painter.fillRect(QRectF(left, p.top, ColumnLeft(axis, last) - left, p.height), Qt::white);
    }
    painter.restore();
}

void CTilxCtrl::PaintBand(QPainter& painter) const {
    if (m_drag != Drag::kBand)
        return;
    const std::optional<QRect> start = RowRect(m_anchorRow);
    const int startY =
        start ? start->top()
              : (m_anchorRow < FirstMiddleIndex() + m_firstRow ? 0 : viewport()->height());
    const double startX = ColumnLeft(Axis(), 0) + m_bandStart * m_scale;
    const QPoint end(std::clamp(m_lastPosition.x(), m_sequenceArea.left(), m_sequenceArea.right()),
                     std::clamp(m_lastPosition.y(), 0, viewport()->height()));
    const QRectF band = QRectF(QPointF(startX, startY), QPointF(end)).normalized();
    painter.save();
    painter.setClipRect(m_sequenceArea);
    painter.setCompositionMode(QPainter::RasterOp_SourceXorDestination);
    painter.setPen(QPen(Qt::white, 1));
    painter.setBrush(Qt::NoBrush);
    painter.drawRect(band);
    painter.restore();
}

// Printing and export.

std::vector<int> CTilxCtrl::PrintRows() const {
    std::vector<int> rows;
    for (int i = 0; i < RowCount(); ++i) {
        if (m_rows[i]->IsPrintable())
            rows.push_back(i);
    }
    return rows;
}

int CTilxCtrl::PrintRowCount() const {
    return static_cast<int>(PrintRows().size());
}

int CTilxCtrl::PrintRowHeight(int row, const CRowPrintOptions&) const {
    const std::vector<int> rows = PrintRows();
    return row >= 0 && row < static_cast<int>(rows.size()) ? m_rows[rows[row]]->RowHeight() : 0;
}

int CTilxCtrl::PrintedNameWidth() const {
    return m_flags.showNames ? std::min(WidestNameWidth() + 10, kMaxPrintedNameWidth) : 0;
}

int CTilxCtrl::PrintedNumberWidth() const {
    return m_flags.showNumbers && m_flags.characterMode ? NumberAreaWidth() : 0;
}

int CTilxCtrl::LeftWidth(const CRowPrintOptions&) const {
    return PrintedNameWidth() + PrintedNumberWidth() + kPrintGap;
}

double CTilxCtrl::ColumnWidth(const CRowPrintOptions& options) const {
    if (options.columnWidth > 0)
        return options.columnWidth;
    return m_flags.fitToWidth ? m_scale : CharacterScale();
}

QSize CTilxCtrl::ContentSize(int firstColumn, int endColumn, int firstRow, int endRow,
                             const CRowPrintOptions& options) const {
    const std::vector<int> rows = PrintRows();
    ClampRange(firstRow, endRow, static_cast<int>(rows.size()));
    ClampRange(firstColumn, endColumn, m_columnCount);
    int height = 0;
    for (int i = firstRow; i < endRow; ++i)
        height += m_rows[rows[i]]->RowHeight();
    const double width = LeftWidth(options) + (endColumn - firstColumn) * ColumnWidth(options);
    return {static_cast<int>(std::ceil(width)), height};
}

void CTilxCtrl::PaintRange(QPainter& painter, QPoint origin, int firstColumn, int endColumn,
                           int firstRow, int endRow, const CRowPrintOptions& options) const {
    const std::vector<int> rows = PrintRows();
    ClampRange(firstRow, endRow, static_cast<int>(rows.size()));
    ClampRange(firstColumn, endColumn, m_columnCount);
    RowFrame frame;
    frame.nameWidth = PrintedNameWidth();
    frame.numberWidth = PrintedNumberWidth();
    frame.axis = {frame.nameWidth + frame.numberWidth + kPrintGap, ColumnWidth(options),
                  firstColumn, m_columnCount};
    frame.endColumn = endColumn;
    frame.printing = options.printing;
    frame.textPerCharacter = options.textPerCharacter;
    frame.emptyBackground = options.printing ? QColor(Qt::white) : palette().color(QPalette::Base);
    painter.save();
    painter.translate(origin);
    int y = 0;
    for (int i = firstRow; i < endRow; ++i) {
        const CScrollWnd& row = *m_rows[rows[i]];
        frame.top = y;
        frame.height = row.RowHeight();
        PaintRow(painter, row, frame);
        y += frame.height;
    }
    painter.restore();
}

// Mouse and keyboard.

void CTilxCtrl::mousePressEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton) {
        QAbstractScrollArea::mousePressEvent(event);
        return;
    }
    setFocus(Qt::MouseFocusReason);
    const QPoint position = event->position().toPoint();
    m_pressPosition = m_lastPosition = position;
    const int index = RowAtY(position.y());
    if (index < 0)
        return;
    if (position.x() < m_sequenceArea.left()) {
        PressName(index, event->modifiers());
        return;
    }
    if (m_flags.mouseSelection && m_scale > 0 && m_columnCount > 0)
        PressSequence(index, position, event->modifiers());
}

void CTilxCtrl::PressName(int index, Qt::KeyboardModifiers modifiers) {
    const int previous = m_currentRow;
    SetCurrentRow(index);
    const bool toggle = IsCtrl(modifiers) || m_flags.clickTogglesName;
    if (toggle) {
        SetRowSelected(index, !RowAt(index)->IsSelected());
    } else if (IsShift(modifiers) && m_flags.multipleSelectedRows && previous >= 0) {
        for (int i = std::min(previous, index); i <= std::max(previous, index); ++i)
            SetRowSelected(i, RowAt(i)->ShowsName());
    } else {
        for (int i = 0; i < RowCount(); ++i)
            SetRowSelected(i, i == index);
    }
    if (RowAt(index)->Group() == RowGroup::kMiddle) {
        m_drag = Drag::kName;
        m_dragRow = index;
        m_nameDragged = false;
    }
}

void CTilxCtrl::PressSequence(int index, QPoint position, Qt::KeyboardModifiers modifiers) {
    CScrollWnd* row = RowAt(index);
    if (row->IsSelectable())
        SetCurrentRow(index);
    const CColumnAxis axis = Axis();
    const int column = ColumnAtX(axis, position.x());
    if (row->IsSelectable() && m_flags.edgeDrag && !IsShift(modifiers)) {
        const CColumnRange selection = row->Selection();
        const SelectionEdge edge = SelectionEdgeAt(axis, position.x(), selection);
        if (edge != SelectionEdge::kNone) {
            m_drag = Drag::kEdge;
            m_dragRow = index;
            m_fixedBoundary = edge == SelectionEdge::kStart ? selection.end : selection.start;
            return;
        }
    }
    if (row->IsSelectable() && IsShift(modifiers) && row->HasSelection()) {
        if (m_anchorRow != index || m_anchorColumn < 0)
            m_anchorColumn = row->Selection().start;
        m_anchorRow = index;
        m_drag = Drag::kExtend;
        m_dragRow = index;
        SetRowSelection(index, DraggedRange());
        return;
    }
    if (!IsCtrl(modifiers))
        ClearSelection();
    m_drag = Drag::kBand;
    m_anchorRow = index;
    m_anchorColumn = column;
    m_bandStart = ColumnCoordinate(axis, position.x());
    viewport()->update();
}

CColumnRange CTilxCtrl::DraggedRange() const {
    const CColumnAxis axis = Axis();
    if (m_drag == Drag::kEdge) {
        return Ordered(m_fixedBoundary, CaretColumnAtX(axis, m_lastPosition.x()));
    }
    const int column = ColumnAtX(axis, m_lastPosition.x());
    const CColumnRange range = Ordered(m_anchorColumn, column);
    return {range.start, range.end + 1};
}

void CTilxCtrl::mouseMoveEvent(QMouseEvent* event) {
    const QPoint position = event->position().toPoint();
    if (!(event->buttons() & Qt::LeftButton) || m_drag == Drag::kNone) {
        UpdateHoverCursor(position);
        return;
    }
    m_lastPosition = position;
    switch (m_drag) {
        case Drag::kName:
            if ((position - m_pressPosition).manhattanLength() >=
                QApplication::startDragDistance()) {
                m_nameDragged = true;
                viewport()->setCursor(Qt::ClosedHandCursor);
            }
            return;
        case Drag::kEdge:
        case Drag::kExtend: {
            const CColumnRange range = DraggedRange();
            if (!range.IsEmpty())
                SetRowSelection(m_dragRow, range);
            break;
        }
        default:
            break;
    }
    UpdateAutoScroll();
    viewport()->update();
}

void CTilxCtrl::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton || m_drag == Drag::kNone) {
        QAbstractScrollArea::mouseReleaseEvent(event);
        return;
    }
    m_lastPosition = event->position().toPoint();
    m_autoScroll.stop();
    const Drag drag = m_drag;
    m_drag = Drag::kNone;
    viewport()->unsetCursor();
    switch (drag) {
        case Drag::kName: {
            if (!m_nameDragged)
                break;
            const int target = BandRowAtY(m_lastPosition.y());
            const int first = FirstMiddleIndex();
            if (target >= first && target < first + MiddleRowCount())
                MoveRow(m_dragRow, target > m_dragRow ? target + 1 : target);
            break;
        }
        case Drag::kBand:
            FinishBand(IsCtrl(event->modifiers()));
            break;
        default: {
            const CColumnRange range = RowAt(m_dragRow)->Selection();
            emit rowRangeSelected(m_dragRow, range.start, range.end);
            emit mouseSelectionCompleted();
            break;
        }
    }
    viewport()->update();
}

int CTilxCtrl::BandRowAtY(int y) const {
    const int index = RowAtY(y);
    if (index >= 0)
        return index;
    // Above or below the shown middle rows: the nearest of them.
    int nearest = -1;
    for (const Placement& p : m_placements) {
        if (p.index < 0 || p.row->Group() != RowGroup::kMiddle)
            continue;
        if (nearest < 0 || y >= p.top)
            nearest = p.index;
    }
    return nearest;
}

void CTilxCtrl::FinishBand(bool adding) {
    const double end = ColumnCoordinate(
        Axis(), std::clamp(m_lastPosition.x(), m_sequenceArea.left(), m_sequenceArea.right()));
    const CColumnRange band = BandColumns(m_bandStart, end, m_columnCount);
    const int endRow = BandRowAtY(std::clamp(m_lastPosition.y(), 0, viewport()->height() - 1));
    // Per-row mode selects the rows the band meets; column mode every row.
    const auto [firstRow, lastRow] =
        m_flags.perRowSelection && endRow >= 0
            ? std::pair(std::min(m_anchorRow, endRow), std::max(m_anchorRow, endRow))
            : std::pair(0, RowCount() - 1);
    for (int i = firstRow; i <= lastRow; ++i) {
        CScrollWnd* row = RowAt(i);
        if (!row || !row->IsSelectable())
            continue;
        CColumnRange range = band;
        if (adding && row->HasSelection()) {
            const CColumnRange old = row->Selection();
            range = {std::min(old.start, band.start), std::max(old.end, band.end)};
        }
        row->SetSelection(range);
        emit rowRangeSelected(i, range.start, range.end);
    }
    emit mouseSelectionCompleted();
}

void CTilxCtrl::mouseDoubleClickEvent(QMouseEvent* event) {
    const QPoint position = event->position().toPoint();
    emit rowDoubleClicked(RowAtY(position.y()), event->modifiers(), position);
}

void CTilxCtrl::UpdateAutoScroll() {
    if (m_flags.noAutoScroll || m_drag == Drag::kName)
        return;
    const bool outside = !m_sequenceArea.contains(m_lastPosition) ||
                         OutsideDirection(m_lastPosition.y(), 0, viewport()->height()) != 0;
    if (outside && !m_autoScroll.isActive())
        m_autoScroll.start();
    else if (!outside)
        m_autoScroll.stop();
}

void CTilxCtrl::AutoScrollTick() {
    if (m_drag == Drag::kNone) {
        m_autoScroll.stop();
        return;
    }
    const int dx =
        OutsideDirection(m_lastPosition.x(), m_sequenceArea.left(), m_sequenceArea.right() + 1);
    // Middle rows scroll when the mouse is above the first or below the last shown one.
    int top = 0;
    int bottom = viewport()->height();
    for (const Placement& p : m_placements) {
        if (p.index >= 0 && p.row->Group() == RowGroup::kMiddle) {
            top = top == 0 ? p.top : std::min(top, p.top);
            bottom = p.top + p.height;
        }
    }
    const int dy = OutsideDirection(m_lastPosition.y(), top, bottom);
    horizontalScrollBar()->setValue(horizontalScrollBar()->value() + dx);
    verticalScrollBar()->setValue(verticalScrollBar()->value() + dy);
    if (m_drag == Drag::kEdge || m_drag == Drag::kExtend) {
        const CColumnRange range = DraggedRange();
        if (!range.IsEmpty())
            SetRowSelection(m_dragRow, range);
    }
    viewport()->update();
}

void CTilxCtrl::UpdateHoverCursor(QPoint position) {
    const int index = RowAtY(position.y());
    const CScrollWnd* row = RowAt(index);
    const bool onEdge =
        row && m_flags.edgeDrag && row->IsSelectable() && m_sequenceArea.contains(position) &&
        SelectionEdgeAt(Axis(), position.x(), row->Selection()) != SelectionEdge::kNone;
    if (onEdge)
        viewport()->setCursor(Qt::SizeHorCursor);
    else
        viewport()->unsetCursor();
}

bool CTilxCtrl::viewportEvent(QEvent* event) {
    if (event->type() == QEvent::ToolTip) {
        ShowTooltip(static_cast<QHelpEvent*>(event));
        return true;
    }
    return QAbstractScrollArea::viewportEvent(event);
}

void CTilxCtrl::ShowTooltip(QHelpEvent* event) {
    const int index = RowAtY(event->pos().y());
    const int column =
        m_sequenceArea.contains(event->pos()) ? ColumnAtX(Axis(), event->pos().x()) : -1;
    const QString text =
        m_flags.tooltips && m_tooltip && index >= 0 ? m_tooltip(index, column) : QString();
    if (text.isEmpty())
        QToolTip::hideText();
    else
        QToolTip::showText(event->globalPos(), text, viewport());
}

void CTilxCtrl::keyPressEvent(QKeyEvent* event) {
    const int first = FirstMiddleIndex();
    const int count = MiddleRowCount();
    switch (event->key()) {
        case Qt::Key_Down:
        case Qt::Key_Up: {
            if (count == 0)
                break;
            const int step = event->key() == Qt::Key_Down ? 1 : -1;
            const int current = m_currentRow < first ? first - step : m_currentRow;
            SetCurrentRow(std::clamp(current + step, first, first + count - 1));
            break;
        }
        case Qt::Key_Right:
        case Qt::Key_Left:
            if (horizontalScrollBar()->isVisible()) {
                const int step = event->key() == Qt::Key_Right ? 1 : -1;
                horizontalScrollBar()->setValue(horizontalScrollBar()->value() + step);
            }
            break;
        default:
            QAbstractScrollArea::keyPressEvent(event);
            return;
    }
    event->accept();
}
