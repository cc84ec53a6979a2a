#include "rows/SegmentView.h"

#include <algorithm>

#include "BlockProject.h"
#include "rows/RulerWnd.h"

namespace {

// The ruler of the block panes: palette-relative grey, ticks of 4 and 2 pixels.
constexpr std::uint32_t kRulerBackground = 0x02C0C0C0;

}  // namespace

CSegmentView::CSegmentView(int paneNumber, QWidget* parent) : CTilxView(paneNumber, parent) {
    connect(Ctrl(), &CTilxCtrl::mouseSelectionCompleted, this, [this] {
        TrimSelectionAtGaps();
        emit selectionCompleted();
    });
}

void CSegmentView::ResetContents() {
    Ctrl()->RemoveAllRows();
    m_addedBlocks.clear();
    m_layout = CAlignmentLayout();
    m_colours = CSegmentColours();
    m_blockColours.clear();
    Ctrl()->Relayout();
}

std::unique_ptr<CSegmentWnd> CSegmentView::CreateMoleculeRow(const std::string& name,
                                                             const std::string& sequence) {
    return std::make_unique<CSegmentWnd>(QString::fromStdString(name), sequence, m_colours);
}

void CSegmentView::BuildRows() {
    CTilxCtrl* ctrl = Ctrl();
    ctrl->RemoveAllRows();
    m_addedBlocks.clear();
    m_layout = CAlignmentLayout();
    const CBlockProject* project = Project();
    if (project && project->MoleculeCount() > 0) {
        m_layout = project->Layout();
        m_colours.textColour = project->Params().TextColour();
        m_colours.linkedTextColour = project->Params().LinkedTextColour();
        m_blockColours.clear();
        const CSimBlockSet& blocks = project->BlockSet();
        for (int b = 0; b < blocks.BlockCount(); ++b)
            m_blockColours.emplace(blocks.BlockAt(b)->Identifier(), blocks.BlockAt(b)->Colour());
        m_colours.blockColour = [this](int identifier) {
            auto it = m_blockColours.find(identifier);
            return it == m_blockColours.end() ? kNoColour : it->second;
        };
        for (int i = 0; i < m_layout.RowCount(); ++i) {
            const CAlignmentLayout::Row& source = m_layout.RowAt(i);
            std::unique_ptr<CSegmentWnd> row = CreateMoleculeRow(source.name, source.sequence);
            row->SetSegments(source.segments);
            ctrl->AddRow(std::move(row));
        }
        auto ruler = std::make_unique<CRulerWnd>(QStringLiteral("RulerWnd"), kRulerBackground);
        ruler->SetColumnCount(m_layout.ColumnCount());
        ctrl->AddRow(std::move(ruler));
    }
    CTilxCtrl::Flags flags = ctrl->GetFlags();
    flags.perRowSelection = true;
    flags.mouseSelection = true;
    ctrl->SetFlags(flags);
}

CSegmentWnd* CSegmentView::MoleculeRow(const std::string& name) const {
    const int index = Ctrl()->IndexOfRow(QString::fromStdString(name));
    return dynamic_cast<CSegmentWnd*>(Ctrl()->RowAt(index));
}

std::vector<ALN_BSEL_ENTRY> CSegmentView::SelectionEntries() const {
    std::vector<ALN_BSEL_ENTRY> entries;
    for (int i = 0; i < Ctrl()->RowCount(); ++i) {
        const CScrollWnd* row = Ctrl()->RowAt(i);
        if (row->HasSelection()) {
            entries.push_back(
                {row->Name().toStdString(), row->Selection().start, row->Selection().end});
        }
    }
    return entries;
}

void CSegmentView::SetSelectionEntries(const std::vector<ALN_BSEL_ENTRY>& entries) {
    CTilxCtrl* ctrl = Ctrl();
    for (int i = 0; i < ctrl->RowCount(); ++i)
        ctrl->RowAt(i)->ClearSelection();
    for (const ALN_BSEL_ENTRY& entry : entries) {
        const int index = ctrl->IndexOfRow(QString::fromStdString(entry.name));
        ctrl->SetRowSelection(index,
                              {std::min(entry.start, entry.end), std::max(entry.start, entry.end)});
    }
    ctrl->viewport()->update();
}

void CSegmentView::TrimSelectionAtGaps() {
    const std::vector<ALN_BSEL_ENTRY> selected = SelectionEntries();
    SetSelectionEntries(TrimSelection(m_layout, selected));
}

void CSegmentView::ShowBlockSelected(const CSimBlock& block, bool add, bool scroll) {
    CTilxCtrl* ctrl = Ctrl();
    if (add)
        m_addedBlocks.push_back(block.Identifier());
    else
        SetSelectionEntries({});
    int leftmost = -1;
    for (const CBlockRowRange& range : BlockRowRanges(m_layout, block)) {
        CSegmentWnd* row = MoleculeRow(m_layout.RowAt(range.row).name);
        if (!row)
            continue;
        if (add) {
            row->AddColourSegment({block.Identifier(), range.position, range.length});
        } else {
            int start = range.start;
            int end = range.end;
            if (row->Segments().TrimAtGaps(start, end))
                row->SetSelection({start, end});
        }
        leftmost = leftmost < 0 ? range.start : std::min(leftmost, range.start);
    }
    if (scroll && leftmost >= 0 && !ctrl->GetFlags().noAutoScroll)
        ctrl->ScrollToShowColumn(leftmost);
    ctrl->viewport()->update();
}

void CSegmentView::RemoveBlockSelection(int blockIdentifier) {
    std::erase(m_addedBlocks, blockIdentifier);
    for (int i = 0; i < Ctrl()->RowCount(); ++i) {
        if (auto* row = dynamic_cast<CSegmentWnd*>(Ctrl()->RowAt(i)))
            row->RemoveColourSegment(blockIdentifier);
    }
    Ctrl()->viewport()->update();
}

void CSegmentView::ClearBlockSelection() {
    m_addedBlocks.clear();
    for (int i = 0; i < Ctrl()->RowCount(); ++i) {
        if (auto* row = dynamic_cast<CSegmentWnd*>(Ctrl()->RowAt(i)))
            row->ClearColourSegments();
    }
    Ctrl()->ClearSelection();
}
