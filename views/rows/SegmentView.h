#pragma once
// Base of the panes that show the molecules as rows laid out by the block links: builds the
// rows from the project, marks blocks as selected or coloured, and trims mouse selections at
// gaps.

#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "layout/AlignmentLayout.h"
#include "layout/Selection.h"
#include "rows/SegmentWnd.h"
#include "rows/TilxView.h"

class CSimBlock;

class CSegmentView : public CTilxView {
    Q_OBJECT
  public:
    explicit CSegmentView(int paneNumber, QWidget* parent = nullptr);

    // The rows refer to the project: drop them before it goes.
    void ResetContents() override;

    // Rebuilds every row from the project: one row per molecule in project order, the ruler,
    // the links applied.
    void BuildRows();
    const CAlignmentLayout& Layout() const { return m_layout; }
    // The molecule row of that name, or null.
    CSegmentWnd* MoleculeRow(const std::string& name) const;

    // The selected columns of every row, in row order.
    std::vector<ALN_BSEL_ENTRY> SelectionEntries() const override;
    // Replaces the selection by these entries (rows that are missing are skipped).
    void SetSelectionEntries(const std::vector<ALN_BSEL_ENTRY>& entries);

    // Shows a block as selected: with `add` its residues are coloured in its colour (and the
    // block is remembered), otherwise the selection becomes the block's columns. With `scroll`
    // the control scrolls to show the block's first column.
    void ShowBlockSelected(const CSimBlock& block, bool add, bool scroll);
    void RemoveBlockSelection(int blockIdentifier);
    // Clears the selection and every coloured block.
    void ClearBlockSelection();
    const std::vector<int>& AddedBlocks() const { return m_addedBlocks; }

  signals:
    // A mouse selection was completed and trimmed at gaps.
    void selectionCompleted();

  protected:
    // Makes the row of one molecule; panes make their own kind.
    virtual std::unique_ptr<CSegmentWnd> CreateMoleculeRow(const std::string& name,
                                                           const std::string& sequence);
    const CSegmentColours& Colours() const { return m_colours; }

  private:
    void TrimSelectionAtGaps();

    CAlignmentLayout m_layout;
    CSegmentColours m_colours;
    // Block colours by identifier, taken from the block set at every build.
    std::unordered_map<int, std::uint32_t> m_blockColours;
    std::vector<int> m_addedBlocks;
};
