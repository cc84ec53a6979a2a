#pragma once
// The rows of a row control: text rows, the ruler and separators. Every row spans the control's
// width and is drawn in three parts: its name in the name area, its position number in the number
// area and its cells in the sequence area. Rows are plain objects owned by the control (not
// widgets), so that a pane of thousands of rows costs what its visible rows cost.

#include <QColor>
#include <QFont>
#include <QString>
#include <cstdint>
#include <optional>

#include "layout/RowGeometry.h"

class QPainter;
class QPalette;

// Where a row stands: above the scrolling rows, among them, or below them.
enum class RowGroup { kTop, kMiddle, kBottom };

// What a row needs to draw its cells.
struct CRowPaintContext {
    CColumnAxis axis;  // x of the columns
    int firstColumn = 0;
    int endColumn = 0;  // one past the last column to draw
    int top = 0;
    int height = 0;
    bool printing = false;
    bool textPerCharacter = false;
    const QPalette* palette = nullptr;
    QColor emptyBackground;  // behind cells without a colour: the window colour, white on paper
};

class CScrollWnd {
  public:
    explicit CScrollWnd(QString name, std::uint32_t ownerData = 0);
    virtual ~CScrollWnd() = default;
    CScrollWnd(const CScrollWnd&) = delete;
    CScrollWnd& operator=(const CScrollWnd&) = delete;

    const QString& Name() const { return m_name; }
    void SetName(const QString& name) { m_name = name; }
    std::uint32_t OwnerData() const { return m_ownerData; }
    // A number unique among all rows made by the program.
    int Identifier() const { return m_identifier; }

    RowGroup Group() const { return m_group; }
    void SetGroup(RowGroup group) { m_group = group; }
    virtual int RowHeight() const { return m_rowHeight; }
    void SetRowHeight(int height) { m_rowHeight = height; }
    // Whether the mouse can select columns of this row.
    bool IsSelectable() const { return m_selectable; }
    void SetSelectable(bool selectable) { m_selectable = selectable; }
    // Whether the row is printed and exported.
    virtual bool IsPrintable() const { return true; }
    // Whether the name area shows the row's name.
    virtual bool ShowsName() const { return true; }

    // The columns this row has (0 for rows without cells of their own).
    virtual int ColumnCount() const { return 0; }
    // The column width the row would like in character mode (0: no wish).
    virtual double PreferredColumnWidth() const { return 0; }
    // The number the number area shows for the row at `column`, when the row has one.
    virtual std::optional<int> PositionNumber(int /*column*/) const { return std::nullopt; }
    // A column's text for copying; empty for rows without text.
    virtual QString TextInColumns(int /*first*/, int /*end*/) const { return {}; }

    // The row's cells, columns context.firstColumn .. context.endColumn - 1.
    virtual void PaintCells(QPainter& painter, const CRowPaintContext& context) const = 0;

    // The selected columns of this row; empty when none.
    CColumnRange Selection() const { return m_selection; }
    void SetSelection(CColumnRange range) {
        m_selection = range.IsEmpty() ? CColumnRange{} : range;
    }
    void ClearSelection() { m_selection = {}; }
    bool HasSelection() const { return !m_selection.IsEmpty(); }
    // The selected state the name area shows.
    bool IsSelected() const { return m_selected; }
    void SetSelected(bool selected) { m_selected = selected; }

  private:
    QString m_name;
    std::uint32_t m_ownerData;
    int m_identifier;
    RowGroup m_group = RowGroup::kMiddle;
    int m_rowHeight = 16;
    bool m_selectable = false;
    CColumnRange m_selection;
    bool m_selected = false;
};

// A separator: one line along its top edge. Not printed.
class CSepWnd : public CScrollWnd {
  public:
    explicit CSepWnd(QString name);
    bool IsPrintable() const override { return false; }
    bool ShowsName() const override { return false; }
    // The line runs from the row's left edge, names included, to one pixel before its end.
    void PaintCells(QPainter& painter, const CRowPaintContext& context) const override;
};
