#include "AlignmentPane.h"

#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QMenu>
#include <QScopedValueRollback>
#include <algorithm>

#include "BlockProject.h"
#include "CommandIds.h"

CBlockAlnView::CBlockAlnView(QWidget* parent) : CSegmentView(kAlnPane, parent) {
    Ctrl()->SetTooltipProvider([this](int row, int column) { return CellTooltip(row, column); });
    ConnectMirroring();
}

void CBlockAlnView::ConnectMirroring() {
    CTilxCtrl* ctrl = Ctrl();
    connect(this, &CSegmentView::selectionCompleted, this, [this] {
        if (m_mirror && !m_mirroring)
            m_mirror->MirrorSelectionCompleted(SelectionEntries(), false);
    });
    connect(ctrl, &CTilxCtrl::selectionCleared, this, [this] {
        if (m_mirror && !m_mirroring)
            m_mirror->MirrorSelectionCleared();
    });
    connect(ctrl, &CTilxCtrl::rowRangeSelected, this, [this](int row, int start, int end) {
        if (m_mirror && !m_mirroring)
            m_mirror->MirrorRowRange(RowName(row), start, end);
    });
    connect(ctrl, &CTilxCtrl::rowMoved, this, [this](int, int to) {
        if (m_mirror && !m_mirroring)
            m_mirror->MirrorRowMoved(RowName(to), to - Ctrl()->FirstMiddleIndex());
    });
    connect(ctrl, &CTilxCtrl::rowSelectedChanged, this, [this](int row, bool selected) {
        if (m_mirror && !m_mirroring && selected && row == Ctrl()->CurrentRow())
            m_mirror->MirrorCurrentRow(RowName(row));
    });
}

std::string CBlockAlnView::RowName(int index) const {
    const CScrollWnd* row = Ctrl()->RowAt(index);
    return row ? row->Name().toStdString() : std::string();
}

void CBlockAlnView::OnUpdate(CPaneView*, int) {
    BuildRows();
}

QString CBlockAlnView::SelectedText() const {
    const CScrollWnd* row = Ctrl()->RowAt(Ctrl()->CurrentRow());
    if (!row || !row->HasSelection())
        return {};
    return row->TextInColumns(row->Selection().start, row->Selection().end);
}

bool CBlockAlnView::UpdateCommand(int id, CCommandState& state) {
    if (id == ID_EDIT_COPY) {
        state.enabled = !SelectedText().isEmpty();
        return true;
    }
    return CSegmentView::UpdateCommand(id, state);
}

void CBlockAlnView::RunCommand(int id) {
    if (id == ID_EDIT_COPY) {
        const QString text = SelectedText();
        if (!text.isEmpty())
            QApplication::clipboard()->setText(text);
        return;
    }
    CSegmentView::RunCommand(id);
}

std::optional<CResidueSelection> CBlockAlnView::SelectionForBroadcast() const {
    const int index = Ctrl()->CurrentRow();
    const auto* row = dynamic_cast<const CSegmentWnd*>(Ctrl()->RowAt(index));
    if (!row || !row->HasSelection())
        return std::nullopt;
    const CColumnRange range = row->Selection();
    const int first = row->Segments().ColumnToPosition(range.start);
    const int residues = row->Segments().ResiduesInColumns(range.start, range.end);
    if (residues <= 0)
        return std::nullopt;
    return CResidueSelection{row->Name().toStdString(), first, first + residues};
}

bool CBlockAlnView::ShowReceivedSelection(const CResidueSelection& selection) {
    const int index = Ctrl()->IndexOfRow(QString::fromStdString(selection.molecule));
    const auto* row = dynamic_cast<const CSegmentWnd*>(Ctrl()->RowAt(index));
    if (!row || selection.last <= selection.first)
        return false;
    const CSegmentRow& segments = row->Segments();
    const int start = segments.PositionToColumn(selection.first);
    const int end = segments.PositionToColumn(selection.last - 1) + 1;
    SetSelectionEntries({{selection.molecule, start, std::min(end, row->ColumnCount())}});
    Ctrl()->SetCurrentRow(index);
    Ctrl()->ScrollToShowColumn(start);
    return true;
}

const std::vector<int>& CBlockAlnView::ContextMenuCommands() {
    static const std::vector<int> commands = {
        ID_DEFINE_BLOCK,        0, ID_LINK,        ID_UNLINK, 0,
        ID_BROADCAST_SELECTION, 0, ID_COLOR_SETUP, 0,         ID_FILE_PRINT_PREVIEW,
        ID_EDIT_CAMERA};
    return commands;
}

QMenu* CBlockAlnView::CreateContextMenu(QWidget* parent) const {
    auto* menu = new QMenu(parent);
    for (int id : ContextMenuCommands()) {
        if (id == 0) {
            menu->addSeparator();
        } else if (QAction* action = CommandAction(id)) {
            menu->addAction(action);
        }
    }
    return menu;
}

void CBlockAlnView::contextMenuEvent(QContextMenuEvent* event) {
    QMenu* menu = CreateContextMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    menu->popup(event->globalPos());
}

QString CBlockAlnView::CellTooltip(int index, int column) const {
    const auto* row = dynamic_cast<const CSegmentWnd*>(Ctrl()->RowAt(index));
    if (!row)
        return {};
    if (column < 0 || column >= row->ColumnCount())
        return row->Name();
    const char residue = row->CharAt(column);
    if (residue == '-')
        return QStringLiteral("%1: gap").arg(row->Name());
    return QStringLiteral("%1: %2 %3")
        .arg(row->Name())
        .arg(QLatin1Char(residue))
        .arg(row->Segments().PositionNumber(column));
}

void CBlockAlnView::MirrorSelectionCompleted(const std::vector<ALN_BSEL_ENTRY>& entries,
                                             bool scroll) {
    const QScopedValueRollback guard(m_mirroring, true);
    SetSelectionEntries(entries);
    if (!scroll || entries.empty())
        return;
    const auto leftmost = std::min_element(
        entries.begin(), entries.end(),
        [](const ALN_BSEL_ENTRY& a, const ALN_BSEL_ENTRY& b) { return a.start < b.start; });
    Ctrl()->ScrollToColumn(leftmost->start - 5);
}

void CBlockAlnView::MirrorSelectionCleared() {
    const QScopedValueRollback guard(m_mirroring, true);
    Ctrl()->ClearSelection();
}

void CBlockAlnView::MirrorRowRange(const std::string& row, int start, int end) {
    const QScopedValueRollback guard(m_mirroring, true);
    Ctrl()->SetRowSelection(Ctrl()->IndexOfRow(QString::fromStdString(row)), {start, end});
}

void CBlockAlnView::MirrorRowMoved(const std::string& row, int index) {
    const QScopedValueRollback guard(m_mirroring, true);
    const int from = Ctrl()->IndexOfRow(QString::fromStdString(row));
    const int to = Ctrl()->FirstMiddleIndex() + index;
    Ctrl()->MoveRow(from, to > from ? to + 1 : to);
}

void CBlockAlnView::MirrorCurrentRow(const std::string& row) {
    const QScopedValueRollback guard(m_mirroring, true);
    const int index = Ctrl()->IndexOfRow(QString::fromStdString(row));
    if (index < 0)
        return;
    for (int i = 0; i < Ctrl()->RowCount(); ++i)
        Ctrl()->SetRowSelected(i, i == index);
    Ctrl()->SetCurrentRow(index);
}
