#pragma once
// Base of the four panes of the main window. The frame creates them once, the layout manager
// moves them between splitters and tabs, the document tells them when the project changed.

#include <QWidget>
#include <functional>
#include <optional>
#include <string>

#include "CommandTarget.h"
#include "layout/Selection.h"

class CBlockProject;
class QAction;
class IPrintableRows;

// Pane numbers, the numbers of the layout strings.
enum PaneNumber : int {
    kTextPane = 0,
    kListPane = 1,
    kSchemPane = 2,
    kAlnPane = 3,
    kPaneCount = 4
};

// What the panes see of the document.
class IPaneDocument {
  public:
    virtual ~IPaneDocument() = default;
    virtual CBlockProject* Project() const = 0;
    virtual void SetModifiedFlag(bool modified = true) = 0;
};

// What a project change touched; panes may skip work for hints that do not concern them.
enum PaneUpdateHint : int { kHintAll = 0, kHintLinks = 1, kHintBlocks = 2, kHintMolecules = 3 };

// A residue range of one molecule, exchanged with sibling programs (positions 0-based).
struct CResidueSelection {
    std::string molecule;
    int first = 0;
    int last = 0;
};

class CPaneView : public QWidget, public ICommandTarget {
    Q_OBJECT
  public:
    CPaneView(int paneNumber, QWidget* parent = nullptr);

    int PaneNumber() const { return m_paneNumber; }
    // The window text of a pane ("Text pane", "Block List Pane", ...).
    static QString PaneTitle(int paneNumber);

    void SetDocument(IPaneDocument* document) { m_document = document; }
    IPaneDocument* Document() const { return m_document; }
    CBlockProject* Project() const { return m_document ? m_document->Project() : nullptr; }

    // Forget everything cached from the project: it is about to be replaced.
    virtual void ResetContents() {}
    // The project changed; `sender` is the pane that caused it, if any.
    virtual void OnUpdate(CPaneView* sender, int hint);

    // Selection exchange with sibling programs: the range to send, and showing a received one
    // (positions are residue positions, `last` exclusive). Panes without sequences keep these.
    virtual std::optional<CResidueSelection> SelectionForBroadcast() const { return {}; }
    virtual bool ShowReceivedSelection(const CResidueSelection&) { return false; }

    // The selected columns of the pane's rows, for the link, unlink and define-block commands;
    // empty for panes without sequence rows.
    virtual std::vector<ALN_BSEL_ENTRY> SelectionEntries() const { return {}; }

    // The rows that printing and figure export draw; null for panes that print nothing.
    virtual const IPrintableRows* PrintableRows() const { return nullptr; }

    bool UpdateCommand(int id, CCommandState& state) override;
    void RunCommand(int id) override;

    // The frame's action of a command, for the panes' context menus; null when there is none.
    using ActionLookup = std::function<QAction*(int id)>;
    void SetActionLookup(ActionLookup lookup) { m_actionLookup = std::move(lookup); }
    QAction* CommandAction(int id) const { return m_actionLookup ? m_actionLookup(id) : nullptr; }

  signals:
    // The pane asks the frame to make another pane active (F6).
    void activatePaneRequested(int paneNumber);

  private:
    int m_paneNumber;
    IPaneDocument* m_document = nullptr;
    ActionLookup m_actionLookup;
};
