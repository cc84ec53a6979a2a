#pragma once
// Plain stand-ins for three panes: the text pane lists the project's molecules (the program's
// molecule selection), the block list shows the blocks in a table, the schematic pane is empty.
// The alignment pane is the real one.

#include <QTableWidget>
#include <QTreeWidget>

#include "AlignmentPane.h"
#include "MoleculeSelection.h"
#include "PaneView.h"

class CBlockTextView : public CPaneView, public IMoleculeSelection {
    Q_OBJECT
  public:
    explicit CBlockTextView(QWidget* parent = nullptr);

    void ResetContents() override;
    void OnUpdate(CPaneView* sender, int hint) override;
    bool UpdateCommand(int id, CCommandState& state) override;
    void RunCommand(int id) override;

    std::vector<std::string> SelectedMolecules() const override;
    int SelectedCount() const override;
    void SelectMolecules(const std::vector<std::string>& names) override;

    QTreeWidget* List() const { return m_list; }

  signals:
    void selectionChanged();

  private:
    QTreeWidget* m_list;
};

class CBlockListView : public CPaneView {
    Q_OBJECT
  public:
    explicit CBlockListView(QWidget* parent = nullptr);

    void ResetContents() override;
    void OnUpdate(CPaneView* sender, int hint) override;

    QTableWidget* Table() const { return m_table; }

  private:
    QTableWidget* m_table;
};

class CBlockSchemView : public CPaneView {
    Q_OBJECT
  public:
    explicit CBlockSchemView(QWidget* parent = nullptr);

  protected:
    void paintEvent(QPaintEvent* event) override;
};
