#include "rows/TilxView.h"

#include <QVBoxLayout>

CTilxView::CTilxView(int paneNumber, QWidget* parent)
    : CPaneView(paneNumber, parent), m_ctrl(new CTilxCtrl(this)) {
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_ctrl);
    setFocusProxy(m_ctrl);
}
