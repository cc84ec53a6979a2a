#pragma once
// One QAction per command id, built from the command table. Running a command and deciding its
// state go to the first target of the chain (active pane, document, frame, application) that
// answers the id; a command nobody answers is disabled. States are refreshed when something
// changed, never by polling.

#include <QAction>
#include <QHash>
#include <QObject>
#include <functional>
#include <vector>

#include "CommandTarget.h"

class CCommandRouter : public QObject {
    Q_OBJECT
  public:
    using Chain = std::function<std::vector<ICommandTarget*>()>;

    explicit CCommandRouter(QObject* parent = nullptr);

    void SetChain(Chain chain) { m_chain = std::move(chain); }
    // The action of a command of the table; created on first use.
    QAction* Action(int id);

    // What the chain says of `id`: disabled when no target answers.
    CCommandState Query(int id) const;
    // Runs `id` when a target answers it and finds it enabled; returns whether it ran.
    bool Run(int id);

    // Refreshes every action now.
    void UpdateAll();
    // Refreshes every action once the event loop is idle again; many calls make one update.
    void RequestUpdate();

  private:
    ICommandTarget* TargetFor(int id, CCommandState& state) const;
    void Apply(int id, QAction* action, const CCommandState& state);

    Chain m_chain;
    QHash<int, QAction*> m_actions;
    bool m_updatePending = false;
};
