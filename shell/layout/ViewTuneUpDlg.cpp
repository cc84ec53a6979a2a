#include "ViewTuneUpDlg.h"

#include <QActionGroup>
#include <QDialogButtonBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QMenu>
#include <QPainter>
#include <QVBoxLayout>

namespace {

constexpr int kKindRole = Qt::UserRole;
constexpr int kTabWidth = 25;
constexpr int kTabHeight = 7;

QString KindLabel(int kind) {
    switch (kind) {
        case kLayoutHorizontal:
            return QStringLiteral("Horizontal");
        case kLayoutVertical:
            return QStringLiteral("Vertical");
        default:
            return QStringLiteral("Tabular");
    }
}

QIcon KindIcon(int kind) {
    switch (kind) {
        case kLayoutHorizontal:
            return QIcon(QStringLiteral(":/icons/layout-horizontal.svg"));
        case kLayoutVertical:
            return QIcon(QStringLiteral(":/icons/layout-vertical.svg"));
        case kLayoutTabular:
            return QIcon(QStringLiteral(":/icons/layout-tabular.svg"));
        default:
            return QIcon(QStringLiteral(":/icons/layout-pane.svg"));
    }
}

}  // namespace

CViewPreview::CViewPreview(const QStringList& paneTitles, QWidget* parent)
    : QWidget(parent), m_paneTitles(paneTitles) {
    setMinimumSize(200, 150);
}

void CViewPreview::SetLayout(std::optional<CLayoutItem> root) {
    m_root = std::move(root);
    update();
}

void CViewPreview::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    painter.fillRect(rect(), palette().window());
    if (!m_root) {
        return;
    }
    QFont font(QStringLiteral("Small Font"));
    font.setStyleHint(QFont::SansSerif);
    font.setPointSize(7);
    painter.setFont(font);
    Draw(painter, *m_root, rect().adjusted(2, 2, -3, -3));
}

void CViewPreview::Draw(QPainter& painter, const CLayoutItem& item, QRect rect) const {
    if (item.IsPane()) {
        painter.fillRect(rect, palette().base());
        painter.setPen(palette().color(QPalette::Dark));
        painter.drawRect(rect);
        painter.setPen(palette().color(QPalette::Text));
        painter.drawText(rect, Qt::AlignCenter | Qt::TextWordWrap, m_paneTitles.value(item.kind));
        return;
    }
    const int count = static_cast<int>(item.children.size());
    if (count == 0) {
        painter.setPen(palette().color(QPalette::Dark));
        painter.drawRect(rect);
        return;
    }
    if (item.IsTabular()) {
        painter.setPen(palette().color(QPalette::Dark));
        painter.drawRect(rect);
        const int tabsTop = rect.bottom() - kTabHeight;
        for (int i = 0; i < count; ++i) {
            const QRect tab(rect.left() + 3 + i * (kTabWidth - 2), tabsTop, kTabWidth, kTabHeight);
            painter.fillRect(tab, i == 0 ? palette().base() : palette().button());
            painter.drawRect(tab);
        }
        Draw(painter, item.children.front(), rect.adjusted(3, 3, -3, -kTabHeight - 3));
        return;
    }
    const bool sideBySide = item.kind == kLayoutHorizontal;
    const int extent = sideBySide ? rect.width() : rect.height();
    for (int i = 0; i < count; ++i) {
        const int begin = extent * i / count;
        const int end = extent * (i + 1) / count;
        const QRect part =
            sideBySide ? QRect(rect.left() + begin, rect.top(), end - begin - 2, rect.height())
                       : QRect(rect.left(), rect.top() + begin, rect.width(), end - begin - 2);
        Draw(painter, item.children[i], part);
    }
}

CViewTuneUpDlg::CViewTuneUpDlg(const CLayoutItem& current, const QStringList& paneTitles,
                               const QString& predefinedLayouts, QWidget* parent)
    : QDialog(parent),
      m_paneTitles(paneTitles),
      m_tree(new QTreeWidget(this)),
      m_preview(new CViewPreview(paneTitles, this)),
      m_predefined(new QComboBox(this)) {
    setWindowTitle(QStringLiteral("PaneManager editor"));
    m_tree->setHeaderHidden(true);
    m_tree->setContextMenuPolicy(Qt::CustomContextMenu);
    m_tree->setMinimumWidth(200);

    m_layouts.emplace_back(QStringLiteral("Custom"), QString());
    for (const auto& [name, layout] : SplitPredefinedLayouts(predefinedLayouts.toStdString())) {
        m_layouts.emplace_back(QString::fromStdString(name), QString::fromStdString(layout));
    }
    for (const auto& entry : m_layouts) {
        m_predefined->addItem(entry.first);
    }
    m_predefined->setEnabled(m_layouts.size() > 1);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
    auto* right = new QVBoxLayout;
    right->addWidget(m_preview, 1);
    right->addWidget(new QLabel(QStringLiteral("Predefined Layouts"), this));
    right->addWidget(m_predefined);
    auto* top = new QHBoxLayout;
    top->addWidget(m_tree, 1);
    top->addLayout(right, 1);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(top, 1);
    layout->addWidget(buttons);

    connect(buttons, &QDialogButtonBox::accepted, this, &CViewTuneUpDlg::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &CViewTuneUpDlg::reject);
    connect(m_tree, &QTreeWidget::customContextMenuRequested, this,
            &CViewTuneUpDlg::ShowContextMenu);
    connect(m_predefined, &QComboBox::activated, this, &CViewTuneUpDlg::OnPredefinedChosen);

    FillTree(current);
    OnTreeChanged();
}

int CViewTuneUpDlg::KindOf(const QTreeWidgetItem* item) {
    return item->data(0, kKindRole).toInt();
}

void CViewTuneUpDlg::SetItemKind(QTreeWidgetItem* item, int kind) const {
    item->setData(0, kKindRole, kind);
    item->setText(0, kind >= 0 ? m_paneTitles.value(kind) : KindLabel(kind));
    item->setIcon(0, KindIcon(kind));
}

QTreeWidgetItem* CViewTuneUpDlg::MakeItem(const CLayoutItem& item) const {
    auto* treeItem = new QTreeWidgetItem;
    SetItemKind(treeItem, item.kind);
    for (const CLayoutItem& child : item.children) {
        treeItem->addChild(MakeItem(child));
    }
    return treeItem;
}

void CViewTuneUpDlg::FillTree(const CLayoutItem& root) {
    m_tree->clear();
    if (root.IsPane()) {
        // The tree always has a group on top, so that the pane can get company.
        CLayoutItem group;
        group.children.push_back(root);
        m_tree->addTopLevelItem(MakeItem(group));
    } else {
        m_tree->addTopLevelItem(MakeItem(root));
    }
    m_tree->expandAll();
}

namespace {

void ComposeItem(const QTreeWidgetItem* item, int kind, QString& out) {
    if (kind >= 0) {
        out += QString::number(kind);
        return;
    }
    const char* brackets = kind == kLayoutVertical ? "{}" : kind == kLayoutTabular ? "[]" : "()";
    out += QLatin1Char(brackets[0]);
    for (int i = 0; i < item->childCount(); ++i) {
        if (i > 0) {
            out += QLatin1Char(',');
        }
        ComposeItem(item->child(i), item->child(i)->data(0, kKindRole).toInt(), out);
    }
    out += QLatin1Char(brackets[1]);
}

}  // namespace

QString CViewTuneUpDlg::ComposeTree() const {
    QString out;
    if (QTreeWidgetItem* root = m_tree->topLevelItem(0)) {
        ComposeItem(root, KindOf(root), out);
    }
    return out;
}

void CViewTuneUpDlg::OnTreeChanged() {
    const QString composed = ComposeTree();
    CLayoutParseResult parsed = ParseLayout(composed.toStdString(), m_paneTitles.size());
    std::optional<CLayoutItem> root;
    int match = 0;
    if (parsed.Ok()) {
        const std::string canonical = ComposeLayout(parsed.root);
        for (std::size_t i = 1; i < m_layouts.size() && match == 0; ++i) {
            const CLayoutParseResult entry =
                ParseLayout(m_layouts[i].second.toStdString(), m_paneTitles.size());
            if (entry.Ok() && ComposeLayout(entry.root) == canonical) {
                match = static_cast<int>(i);
            }
        }
        root = std::move(parsed.root);
    }
    m_preview->SetLayout(std::move(root));
    if (match == 0) {
        m_layouts.front().second = composed;
    }
    m_predefined->setCurrentIndex(match);
}

void CViewTuneUpDlg::OnPredefinedChosen(int index) {
    if (index < 0 || index >= static_cast<int>(m_layouts.size())) {
        return;
    }
    const CLayoutParseResult parsed =
        ParseLayout(m_layouts[index].second.toStdString(), m_paneTitles.size());
    if (parsed.Ok()) {
        FillTree(parsed.root);
        OnTreeChanged();
    }
}

void CViewTuneUpDlg::ChangeKind(QTreeWidgetItem* item, int kind) {
    if (item && KindOf(item) < 0 && kind < 0) {
        SetItemKind(item, kind);
        OnTreeChanged();
    }
}

bool CViewTuneUpDlg::CanDismiss(QTreeWidgetItem* item) const {
    return item && KindOf(item) < 0 && item->parent();
}

void CViewTuneUpDlg::Dismiss(QTreeWidgetItem* item) {
    if (!CanDismiss(item)) {
        return;
    }
    QTreeWidgetItem* parent = item->parent();
    const QList<QTreeWidgetItem*> members = item->takeChildren();
    delete parent->takeChild(parent->indexOfChild(item));
    parent->addChildren(members);
    m_tree->expandAll();
    OnTreeChanged();
}

void CViewTuneUpDlg::AddSublayout(QTreeWidgetItem* item, int kind) {
    if (!item || kind >= 0) {
        return;
    }
    QTreeWidgetItem* group = KindOf(item) < 0 ? item : item->parent();
    CLayoutItem empty;
    empty.kind = kind;
    group->addChild(MakeItem(empty));
    m_tree->expandAll();
    OnTreeChanged();
}

bool CViewTuneUpDlg::CanMove(QTreeWidgetItem* item, int offset) const {
    if (!item || !item->parent() || (offset != 1 && offset != -1)) {
        return false;
    }
    const int target = item->parent()->indexOfChild(item) + offset;
    return target >= 0 && target < item->parent()->childCount();
}

void CViewTuneUpDlg::Move(QTreeWidgetItem* item, int offset) {
    if (!CanMove(item, offset)) {
        return;
    }
    QTreeWidgetItem* parent = item->parent();
    const int index = parent->indexOfChild(item);
    parent->takeChild(index);
    parent->insertChild(index + offset, item);
    m_tree->expandAll();
    m_tree->setCurrentItem(item);
    OnTreeChanged();
}

void CViewTuneUpDlg::ShowContextMenu(const QPoint& position) {
    QTreeWidgetItem* item = m_tree->itemAt(position);
    if (!item) {
        return;
    }
    m_tree->setCurrentItem(item);
    const bool isGroup = KindOf(item) < 0;
    QMenu menu(this);
    QMenu* change = menu.addMenu(QStringLiteral("Change sublayout"));
    QMenu* add = menu.addMenu(QStringLiteral("New sublayout"));
    const std::pair<const char*, int> kinds[] = {{"&Horizontal", kLayoutHorizontal},
                                                 {"&Vertical", kLayoutVertical},
                                                 {"&Tabular", kLayoutTabular}};
    auto* changeGroup = new QActionGroup(change);
    for (const auto& [text, kind] : kinds) {
        QAction* action = change->addAction(QString::fromLatin1(text));
        action->setCheckable(true);
        action->setActionGroup(changeGroup);
        action->setChecked(KindOf(item) == kind);
        action->setEnabled(isGroup);
        connect(action, &QAction::triggered, this, [this, item, kind] { ChangeKind(item, kind); });
        connect(add->addAction(QString::fromLatin1(text)), &QAction::triggered, this,
                [this, item, kind] { AddSublayout(item, kind); });
    }
    QAction* dismiss = menu.addAction(QStringLiteral("&Dismiss"));
    dismiss->setEnabled(CanDismiss(item));
    connect(dismiss, &QAction::triggered, this, [this, item] { Dismiss(item); });
    menu.insertAction(add->menuAction(), dismiss);
    QAction* up = menu.addAction(QStringLiteral("&Up"));
    up->setEnabled(CanMove(item, -1));
    connect(up, &QAction::triggered, this, [this, item] { Move(item, -1); });
    QAction* down = menu.addAction(QStringLiteral("&Down"));
    down->setEnabled(CanMove(item, 1));
    connect(down, &QAction::triggered, this, [this, item] { Move(item, 1); });
    menu.exec(m_tree->viewport()->mapToGlobal(position));
}

void CViewTuneUpDlg::accept() {
    m_result = ComposeTree();
    QDialog::accept();
}
