#pragma once
// Plain stand-ins for the four panes: the text pane lists the project's molecules (the
// program's molecule selection), the block list shows the blocks in a table, the schematic and
// alignment panes are empty.

#include <QTableWidget>
#include <QTreeWidget>

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

class CBlockAlnView : public CPaneView {
    Q_OBJECT
  public:
    explicit CBlockAlnView(QWidget* parent = nullptr);

  protected:
    void paintEvent(QPaintEvent* event) override;
};
