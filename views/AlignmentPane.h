#pragma once
// The alignment pane: every molecule as a row of residues, one character per display column,
// laid out by the block links so that linked blocks stand in the same columns (linked residues
// in upper case, "-" for gaps), under a ruler. Its selections are repeated in the schematic
// pane and handed to the document's link, unlink and define-block commands.

#include <QPointer>
#include <vector>

#include "SelectionMirror.h"
#include "rows/SegmentView.h"

class QMenu;

class CBlockAlnView : public CSegmentView, public ISelectionMirror {
    Q_OBJECT
  public:
    explicit CBlockAlnView(QWidget* parent = nullptr);

    // The pane whose selections this one repeats and which repeats this one's (or null).
    void SetMirror(ISelectionMirror* mirror) { m_mirror = mirror; }

    void OnUpdate(CPaneView* sender, int hint) override;
    bool UpdateCommand(int id, CCommandState& state) override;
    void RunCommand(int id) override;
    std::optional<CResidueSelection> SelectionForBroadcast() const override;
    bool ShowReceivedSelection(const CResidueSelection& selection) override;

    // The selected characters of the current row, as shown.
    QString SelectedText() const;
    // The commands of the pane's context menu in order; 0 stands for a separator.
    static const std::vector<int>& ContextMenuCommands();
    // The context menu built from the frame's actions (commands without one are left out).
    QMenu* CreateContextMenu(QWidget* parent) const;

    void MirrorSelectionCompleted(const std::vector<ALN_BSEL_ENTRY>& entries, bool scroll) override;
    void MirrorSelectionCleared() override;
    void MirrorRowRange(const std::string& row, int start, int end) override;
    void MirrorRowMoved(const std::string& row, int index) override;
    void MirrorCurrentRow(const std::string& row) override;

  protected:
    void contextMenuEvent(QContextMenuEvent* event) override;

  private:
    void ConnectMirroring();
    // The tooltip of a cell: the molecule, the residue and its number.
    QString CellTooltip(int row, int column) const;
    std::string RowName(int index) const;

    ISelectionMirror* m_mirror = nullptr;
    bool m_mirroring = false;  // set while repeating the other pane's event
};
