#pragma once
// A pane that hosts a row control filling its whole client area.

#include "PaneView.h"
#include "rows/TilxCtrl.h"

class CTilxView : public CPaneView {
    Q_OBJECT
  public:
    explicit CTilxView(int paneNumber, QWidget* parent = nullptr);

    CTilxCtrl* Ctrl() const { return m_ctrl; }
    const IPrintableRows* PrintableRows() const override { return m_ctrl; }

  private:
    CTilxCtrl* m_ctrl;
};
