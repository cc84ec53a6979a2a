#pragma once
// The numbered ruler above the rows: column numbers counted from 1, long ticks at the labels,
// short ticks between them and a base line along the bottom.

#include <QFont>
#include <cstdint>

#include "rows/ScrollWnd.h"

class CRulerWnd : public CScrollWnd {
  public:
    // `background` is a stored colour value; "no colour" means the window colour.
    CRulerWnd(QString name, std::uint32_t background, int longTick = 4, int shortTick = 2);

    bool ShowsName() const override { return false; }
    // The ruler numbers the control's columns.
    void SetColumnCount(int columns) { m_columns = columns; }
    // The label and short-tick steps at a scale.
    CRulerSteps Steps(double scale) const;
    void PaintCells(QPainter& painter, const CRowPaintContext& context) const override;

    static constexpr std::uint32_t kTextColour = 0x7F0000;
    static constexpr std::uint32_t kLineColour = 0x007F00;
    static constexpr int kMinLabelStep = 10;
    static constexpr int kShortTickBase = 1;

  private:
    void PaintLabel(QPainter& painter, const CRowPaintContext& context, double x, int number,
                    Qt::Alignment side) const;

    std::uint32_t m_background;
    int m_longTick;
    int m_shortTick;
    int m_columns = 0;
    QFont m_font;
};
