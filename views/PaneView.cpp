#include "PaneView.h"

#include "CommandIds.h"

CPaneView::CPaneView(int paneNumber, QWidget* parent) : QWidget(parent), m_paneNumber(paneNumber) {
    setWindowTitle(PaneTitle(paneNumber));
    setObjectName(PaneTitle(paneNumber));
    setFocusPolicy(Qt::StrongFocus);
}

QString CPaneView::PaneTitle(int paneNumber) {
    switch (paneNumber) {
        case kTextPane:
            return QStringLiteral("Text pane");
        case kListPane:
            return QStringLiteral("Block List Pane");
        case kSchemPane:
            return QStringLiteral("Schematic Pane");
        case kAlnPane:
            return QStringLiteral("Alignment Pane");
        default:
            return {};
    }
}

void CPaneView::OnUpdate(CPaneView*, int) {
    update();
}

bool CPaneView::UpdateCommand(int id, CCommandState& state) {
    if (id != ID_NEXT_PANE) {
        return false;
    }
    static const char* const kNextTexts[kPaneCount] = {
        "Activate Block List Pane", "Activate Schematic Pane", "Activate Alignment Pane",
        "Activate Text Pane"};
    state.enabled = true;
    state.text = QString::fromLatin1(kNextTexts[m_paneNumber % kPaneCount]);
    return true;
}

void CPaneView::RunCommand(int id) {
    if (id == ID_NEXT_PANE) {
        emit activatePaneRequested((m_paneNumber + 1) % kPaneCount);
    }
}
