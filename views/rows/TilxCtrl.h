#pragma once
// The row control: rows of sequences sharing one column axis, with a name area, a number area
// and a sequence area, scroll bars, and selections made with the mouse. The top and bottom row
// groups stay in place; the middle rows scroll vertically. Horizontal scroll positions are
// display columns, vertical ones middle-row indices.

#include <QAbstractScrollArea>
#include <QFont>
#include <QHelpEvent>
#include <QTimer>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "rows/PrintableRows.h"
#include "rows/ScrollWnd.h"

class CTilxCtrl : public QAbstractScrollArea, public IPrintableRows {
    Q_OBJECT
  public:
    struct Flags {
        bool characterMode = true;  // scale from the rows' character cells
        bool fitToWidth = false;    // scale so that all columns fit
        bool showNames = true;
        bool showNumbers = true;
        bool perRowSelection = true;  // each row keeps its own range
        bool mouseSelection = true;
        bool edgeDrag = true;
        bool noAutoScroll = false;
        bool tooltips = true;
        bool clickTogglesName = false;  // every click on a name acts as a Ctrl-click
        bool multipleSelectedRows = true;
    };
    // Where a row stands on the screen.
    struct Placement {
        const CScrollWnd* row;
        int index;  // in Rows(); -1 for the separators
        int top;
        int height;
    };

    explicit CTilxCtrl(QWidget* parent = nullptr);
    ~CTilxCtrl() override;

    // Rows, grouped: top rows, then middle rows, then bottom rows, each group in adding order.
    CScrollWnd* AddRow(std::unique_ptr<CScrollWnd> row);
    void RemoveAllRows();
    int RowCount() const { return static_cast<int>(m_rows.size()); }
    CScrollWnd* RowAt(int index) const;
    // The first row with exactly that name, or -1.
    int IndexOfRow(const QString& name) const;
    int MiddleRowCount() const;
    int FirstMiddleIndex() const;
    // Moves a middle row before another one (`before` = one past the last: to the end).
    bool MoveRow(int from, int before);

    const Flags& GetFlags() const { return m_flags; }
    void SetFlags(const Flags& flags);
    // Names longer than this many characters are cut and end in "..." (0: no limit).
    void SetMaxNameLength(int length);
    // Columns added to the column count for the number area's width.
    void SetExtraColumns(int columns);
    const QFont& NameFont() const { return m_nameFont; }

    // Geometry, recomputed by Relayout() and on every size change.
    void Relayout();
    double Scale() const { return m_scale; }
    int FirstColumn() const { return m_firstColumn; }
    int VisibleColumnCount() const { return VisibleColumns(m_sequenceArea.width(), m_scale); }
    int FirstRow() const { return m_firstRow; }
    QRect NameArea() const { return m_nameArea; }
    QRect NumberArea() const { return m_numberArea; }
    QRect SequenceArea() const { return m_sequenceArea; }
    CColumnAxis Axis() const {
        return {m_sequenceArea.left(), m_scale, m_firstColumn, m_columnCount};
    }
    const std::vector<Placement>& Placements() const { return m_placements; }
    // The rectangle of a row in the viewport, when the row is shown.
    std::optional<QRect> RowRect(int index) const;
    // The row at `y` of the viewport, or -1.
    int RowAtY(int y) const;

    void ScrollToColumn(int column);
    // Scrolls only when `column` is not visible, and then shows it 5 columns from the left.
    void ScrollToShowColumn(int column);
    void ScrollToRow(int middleIndex);

    // Selections.
    int CurrentRow() const { return m_currentRow; }
    void SetCurrentRow(int index);
    void SetRowSelection(int index, CColumnRange range);
    // Clears every row's range (and reports it).
    void ClearSelection();
    void SetRowSelected(int index, bool selected);

    using TooltipProvider = std::function<QString(int row, int column)>;
    void SetTooltipProvider(TooltipProvider provider) { m_tooltip = std::move(provider); }

    // The automatic scrolling while the mouse is held outside the sequence area.
    bool IsAutoScrolling() const { return m_autoScroll.isActive(); }
    void AutoScrollTick();

    // Printing and export.
    int ColumnCount() const override { return m_columnCount; }
    int PrintRowCount() const override;
    int PrintRowHeight(int row, const CRowPrintOptions& options) const override;
    int LeftWidth(const CRowPrintOptions& options) const override;
    double ColumnWidth(const CRowPrintOptions& options) const override;
    QSize ContentSize(int firstColumn, int endColumn, int firstRow, int endRow,
                      const CRowPrintOptions& options) const override;
    void PaintRange(QPainter& painter, QPoint origin, int firstColumn, int endColumn, int firstRow,
                    int endRow, const CRowPrintOptions& options) const override;

  signals:
    void selectionCleared();
    void rowRangeSelected(int row, int start, int end);
    void mouseSelectionCompleted();
    void rowSelectedChanged(int row, bool selected);
    void currentRowChanged(int row);
    void rowDoubleClicked(int row, Qt::KeyboardModifiers modifiers, QPoint position);
    void rowMoved(int from, int to);
    void columnsScrolled(int firstColumn);
    void rowsScrolled(int firstRow);

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void scrollContentsBy(int dx, int dy) override;
    bool viewportEvent(QEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

  private:
    enum class Drag { kNone, kBand, kEdge, kExtend, kName };
    // What one row is painted with, on any device.
    struct RowFrame {
        int top = 0;
        int height = 0;
        int nameWidth = 0;
        int numberWidth = 0;
        CColumnAxis axis;
        int endColumn = 0;
        bool printing = false;
        bool textPerCharacter = false;
        QColor emptyBackground;
        bool selected = false;
        bool current = false;
    };
    void PaintRow(QPainter& painter, const CScrollWnd& row, const RowFrame& frame) const;
    void PaintName(QPainter& painter, const CScrollWnd& row, const RowFrame& frame) const;
    void PaintNumber(QPainter& painter, const CScrollWnd& row, const RowFrame& frame) const;
    void PaintSelections(QPainter& painter) const;
    void PaintBand(QPainter& painter) const;

    int WidestNameWidth() const;
    int NumberAreaWidth() const;
    int PrintedNameWidth() const;
    int PrintedNumberWidth() const;
    double CharacterScale() const;
    void UpdateScrollBars();
    void UpdatePlacements();
    int MaxFirstRow() const;
    std::vector<int> PrintRows() const;

    void PressName(int index, Qt::KeyboardModifiers modifiers);
    void PressSequence(int index, QPoint position, Qt::KeyboardModifiers modifiers);
    void FinishBand(bool adding);
    // The row under `y`, held to the shown middle rows when `y` lies above or below them.
    int BandRowAtY(int y) const;
    CColumnRange DraggedRange() const;
    void UpdateAutoScroll();
    void UpdateHoverCursor(QPoint position);
    void ShowTooltip(QHelpEvent* event);

    std::vector<std::unique_ptr<CScrollWnd>> m_rows;
    CSepWnd m_sepTop;
    CSepWnd m_sepBottom;
    Flags m_flags;
    QFont m_nameFont;
    int m_maxNameLength = 0;
    int m_extraColumns = 0;
    int m_widestName = 0;
    int m_columnCount = 0;
    double m_scale = 0;
    int m_firstColumn = 0;
    int m_firstRow = 0;
    QRect m_nameArea;
    QRect m_numberArea;
    QRect m_sequenceArea;
    std::vector<Placement> m_placements;
    int m_currentRow = -1;
    TooltipProvider m_tooltip;

    // The gesture in progress.
    Drag m_drag = Drag::kNone;
    int m_dragRow = -1;
    double m_bandStart = 0;   // fractional column where the band began
    int m_fixedBoundary = 0;  // the column boundary that stays while an edge is dragged
    int m_anchorColumn = -1;
    int m_anchorRow = -1;
    QPoint m_pressPosition;
    QPoint m_lastPosition;
    bool m_nameDragged = false;
    QTimer m_autoScroll;
};
