#pragma once
// A row that shows a text, one character per display column, in a fixed-pitch font.

#include <QColor>
#include <QFont>
#include <string>

#include "rows/ScrollWnd.h"

class CTextWnd : public CScrollWnd {
  public:
    explicit CTextWnd(QString name, std::string text = {}, std::uint32_t ownerData = 0);

    const std::string& Text() const { return m_text; }
    void SetText(std::string text) { m_text = std::move(text); }
    // The character at `column`; a space beyond the text.
    char CharAt(int column) const;

    // The default row font: "Courier New", 16 pixels high, fixed pitch.
    static QFont DefaultFont();
    const QFont& Font() const { return m_font; }
    void SetFont(const QFont& font);

    int RowHeight() const override { return m_textHeight; }
    int ColumnCount() const override { return static_cast<int>(m_text.size()); }
    // The character cell: the font's advance rounded to whole pixels.
    double PreferredColumnWidth() const override { return m_cellWidth; }
    QString TextInColumns(int first, int end) const override;
    void PaintCells(QPainter& painter, const CRowPaintContext& context) const override;

  protected:
    // The colours of a cell; by default the palette's text on the empty background.
    virtual QColor TextColourAt(int column, const CRowPaintContext& context) const;
    virtual QColor BackgroundAt(int column, const CRowPaintContext& context) const;

  private:
    // Draws the characters of columns [first, end) in the painter's pen: as one run, or one by
    // one centred in their cells.
    void PaintText(QPainter& painter, const CRowPaintContext& context, int first, int end,
                   bool wholeRun) const;

    std::string m_text;
    QFont m_font;
    int m_textHeight = 16;
    int m_cellWidth = 10;
    int m_ascent = 12;
};
