#include "CommandRouter.h"

#include <QIcon>
#include <QTimer>

#include "CommandTable.h"

CCommandRouter::CCommandRouter(QObject* parent) : QObject(parent) {}

QAction* CCommandRouter::Action(int id) {
    if (QAction* existing = m_actions.value(id)) {
        return existing;
    }
    const CCommandInfo* info = FindCommand(id);
    auto* action = new QAction(this);
    if (info) {
        action->setText(info->MenuText());
        action->setShortcuts(info->Keys());
        action->setStatusTip(info->StatusText());
        action->setToolTip(info->ToolTip().isEmpty() ? info->StatusText() : info->ToolTip());
        action->setWhatsThis(info->StatusText());
        action->setCheckable(info->checkable);
        if (!info->IconPath().isEmpty()) {
            action->setIcon(QIcon(info->IconPath()));
        }
    }
    action->setData(id);
    connect(action, &QAction::triggered, this, [this, id] { Run(id); });
    m_actions.insert(id, action);
    return action;
}

ICommandTarget* CCommandRouter::TargetFor(int id, CCommandState& state) const {
    if (!m_chain) {
        return nullptr;
    }
    for (ICommandTarget* target : m_chain()) {
        state = CCommandState();
        if (target && target->UpdateCommand(id, state)) {
            return target;
        }
    }
    return nullptr;
}

CCommandState CCommandRouter::Query(int id) const {
    CCommandState state;
    if (!TargetFor(id, state)) {
        state = CCommandState();
        state.enabled = false;
    }
    return state;
}

bool CCommandRouter::Run(int id) {
    CCommandState state;
    ICommandTarget* target = TargetFor(id, state);
    if (!target || !state.enabled) {
        RequestUpdate();
        return false;
    }
    target->RunCommand(id);
    RequestUpdate();
    return true;
}

void CCommandRouter::Apply(int id, QAction* action, const CCommandState& state) {
    action->setEnabled(state.enabled);
    action->setVisible(state.visible);
    if (action->isCheckable()) {
        action->setChecked(state.checked);
    }
    if (!state.text.isEmpty()) {
        action->setText(state.text);
    } else if (const CCommandInfo* info = FindCommand(id)) {
        action->setText(info->MenuText());
    }
}

void CCommandRouter::UpdateAll() {
    m_updatePending = false;
    for (auto it = m_actions.cbegin(); it != m_actions.cend(); ++it) {
        Apply(it.key(), it.value(), Query(it.key()));
    }
}

void CCommandRouter::RequestUpdate() {
    if (m_updatePending) {
        return;
    }
    m_updatePending = true;
    QTimer::singleShot(0, this, &CCommandRouter::UpdateAll);
}
