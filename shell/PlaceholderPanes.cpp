#include "PlaceholderPanes.h"

#include <QHeaderView>
#include <QPainter>
#include <QSet>
#include <QVBoxLayout>

#include "BlockProject.h"
#include "BlockSignificance.h"
#include "CommandIds.h"

namespace {

void FillPane(QWidget* pane, QWidget* content) {
    auto* layout = new QVBoxLayout(pane);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(content);
    pane->setFocusProxy(content);
}

QTableWidgetItem* Cell(const QString& text, Qt::Alignment alignment) {
    auto* item = new QTableWidgetItem(text);
    item->setTextAlignment(alignment | Qt::AlignVCenter);
    item->setFlags(Qt::ItemIsEnabled | Qt::ItemIsSelectable);
    return item;
}

// Stored colours hold red in the low byte; the top byte marks "none" and palette entries.
QColor ColourOf(std::uint32_t value) {
    if (value == 0x01000000u) {
        return {};
    }
    return QColor(value & 0xFF, (value >> 8) & 0xFF, (value >> 16) & 0xFF);
}

// An empty pane shows its name, faintly, so that the arrangement can be told apart.
void PaintPaneTitle(QWidget* pane) {
    QPainter painter(pane);
    painter.setPen(pane->palette().color(QPalette::Disabled, QPalette::Text));
    painter.drawText(pane->rect(), Qt::AlignCenter, pane->windowTitle());
}

}  // namespace

CBlockTextView::CBlockTextView(QWidget* parent)
    : CPaneView(kTextPane, parent), m_list(new QTreeWidget(this)) {
    m_list->setColumnCount(2);
    m_list->setHeaderLabels({QStringLiteral("Molecule"), QStringLiteral("Length")});
    m_list->setRootIsDecorated(false);
    m_list->setSelectionMode(QAbstractItemView::ExtendedSelection);
    m_list->setUniformRowHeights(true);
    m_list->header()->setSectionResizeMode(0, QHeaderView::Stretch);
    m_list->header()->setSectionResizeMode(1, QHeaderView::ResizeToContents);
    m_list->header()->setStretchLastSection(false);
    FillPane(this, m_list);
    connect(m_list, &QTreeWidget::itemSelectionChanged, this, &CBlockTextView::selectionChanged);
}

void CBlockTextView::ResetContents() {
    m_list->clear();
}

void CBlockTextView::OnUpdate(CPaneView*, int hint) {
    if (hint == kHintLinks) {
        return;
    }
    const std::vector<std::string> selected = SelectedMolecules();
    const QSignalBlocker blocker(m_list);
    m_list->clear();
    if (CBlockProject* project = Project()) {
        for (int i = 0; i < project->MoleculeCount(); ++i) {
            const CSxMolX* molecule = project->MoleculeAt(i);
            auto* item = new QTreeWidgetItem({QString::fromStdString(molecule->Name()),
                                              QString::number(molecule->SequenceLength())});
            item->setTextAlignment(1, Qt::AlignRight | Qt::AlignVCenter);
            m_list->addTopLevelItem(item);
        }
    }
    SelectMolecules(selected);
    emit selectionChanged();
}

std::vector<std::string> CBlockTextView::SelectedMolecules() const {
    std::vector<std::string> names;
    for (int i = 0; i < m_list->topLevelItemCount(); ++i) {
        if (m_list->topLevelItem(i)->isSelected()) {
            names.push_back(m_list->topLevelItem(i)->text(0).toStdString());
        }
    }
    return names;
}

int CBlockTextView::SelectedCount() const {
    return static_cast<int>(m_list->selectedItems().size());
}

void CBlockTextView::SelectMolecules(const std::vector<std::string>& names) {
    QSet<QString> wanted;
    for (const std::string& name : names) {
        wanted.insert(QString::fromStdString(name));
    }
    {
        const QSignalBlocker blocker(m_list);
        for (int i = 0; i < m_list->topLevelItemCount(); ++i) {
            QTreeWidgetItem* item = m_list->topLevelItem(i);
            item->setSelected(wanted.contains(item->text(0)));
        }
    }
    emit selectionChanged();
}

bool CBlockTextView::UpdateCommand(int id, CCommandState& state) {
    if (id == ID_EDIT_SELECT_ALL) {
        state.enabled = m_list->topLevelItemCount() > 0;
        return true;
    }
    return CPaneView::UpdateCommand(id, state);
}

void CBlockTextView::RunCommand(int id) {
    if (id == ID_EDIT_SELECT_ALL) {
        m_list->selectAll();
        return;
    }
    CPaneView::RunCommand(id);
}

CBlockListView::CBlockListView(QWidget* parent)
    : CPaneView(kListPane, parent), m_table(new QTableWidget(0, 8, this)) {
    m_table->setHorizontalHeaderLabels(
        {QString(), "name", "m", "len", "MP-score", "SP-score", "Signif.", "Offset"});
    m_table->verticalHeader()->hide();
    m_table->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_table->setEditTriggers(QAbstractItemView::NoEditTriggers);
    m_table->setShowGrid(false);
    m_table->setAlternatingRowColors(true);
    const int widths[8] = {18, 70, 30, 36, 70, 70, 52, 52};
    for (int column = 0; column < 8; ++column) {
        m_table->setColumnWidth(column, widths[column]);
    }
    m_table->horizontalHeader()->setSectionResizeMode(1, QHeaderView::Stretch);
    m_table->verticalHeader()->setDefaultSectionSize(m_table->fontMetrics().height() + 6);
    FillPane(this, m_table);
}

void CBlockListView::ResetContents() {
    m_table->setRowCount(0);
}

void CBlockListView::OnUpdate(CPaneView*, int hint) {
    if (hint == kHintLinks) {
        return;
    }
    CBlockProject* project = Project();
    const CSimBlockSet* blocks = project ? &project->BlockSet() : nullptr;
    m_table->setRowCount(blocks ? blocks->BlockCount() : 0);
    for (int row = 0; blocks && row < blocks->BlockCount(); ++row) {
        const CSimBlock& block = *blocks->BlockAt(row);
        const CBlockSignificance significance =
            EvaluateBlockSignificance(block, blocks, project->Params().Matrix(),
                                      project->Params().ExpectationLimit(), CSimBlock::kCurrent);
        const Qt::Alignment right = Qt::AlignRight;
        auto* colour = Cell(QString(), Qt::AlignLeft);
        colour->setBackground(ColourOf(block.Colour()));
        m_table->setItem(row, 0, colour);
        m_table->setItem(row, 1, Cell(QString::fromStdString(block.Name()), Qt::AlignLeft));
        m_table->setItem(row, 2,
                         Cell(QString::number(block.SequenceCount(CSimBlock::kCurrent)), right));
        m_table->setItem(row, 3, Cell(QString::number(block.Width(CSimBlock::kCurrent)), right));
        m_table->setItem(
            row, 4,
            Cell(QString::asprintf("%.1f", block.MeanPairScore(CSimBlock::kCurrent)), right));
        m_table->setItem(row, 5, Cell(QString::number(block.Score(CSimBlock::kCurrent)), right));
        const char* state = significance.state == kSignificant      ? "yes"
                            : significance.state == kNotSignificant ? "no"
                                                                    : "n/a";
        m_table->setItem(row, 6, Cell(QString::fromLatin1(state), Qt::AlignHCenter));
        m_table->setItem(row, 7,
                         Cell(QString::number(block.LowestStart(CSimBlock::kCurrent) + 1), right));
    }
}

CBlockSchemView::CBlockSchemView(QWidget* parent) : CPaneView(kSchemPane, parent) {
    setAutoFillBackground(true);
    setBackgroundRole(QPalette::Base);
}

void CBlockSchemView::paintEvent(QPaintEvent*) {
    PaintPaneTitle(this);
}
