#include "ViewManager.h"

#include <QLayout>
#include <QStackedWidget>
#include <QVBoxLayout>

#include "../Settings.h"
#include "ViewTuneUpDlg.h"

using namespace SettingsKeys;

namespace {

constexpr int kFirstPaneId = 0xE900;  // control id of the outermost window
constexpr int kMinimumMemberSize = 4;

QList<int> EqualShares(int extent, int count) {
    QList<int> sizes;
    for (int i = 0; i < count; ++i) {
        sizes << (i + 1 < count ? extent / count : extent - extent / count * (count - 1));
    }
    return sizes;
}

QList<int> NumbersOf(const QString& text) {
    QList<int> numbers;
    for (const QString& part : text.split(QLatin1Char('|'), Qt::SkipEmptyParts)) {
        bool ok = false;
        const int value = part.trimmed().toInt(&ok);
        if (!ok) {
            return {};
        }
        numbers << value;
    }
    return numbers;
}

}  // namespace

CMngrSplitter::CMngrSplitter(Qt::Orientation orientation, int controlId, QWidget* parent)
    : QSplitter(orientation, parent) {
    const QString text = QStringLiteral("CMngrSplitter id=0x%1").arg(controlId, 0, 16);
    setWindowTitle(text);
    setObjectName(text);
    setChildrenCollapsible(false);
}

CTabViewHolder::CTabViewHolder(QWidget* parent) : QTabWidget(parent) {
    setObjectName(QStringLiteral("CTabViewHolder"));
    setTabPosition(QTabWidget::South);
    setDocumentMode(true);
}

CViewManager::CViewManager(QWidget* host, CSettings& settings, QObject* parent)
    : QObject(parent), m_host(host), m_settings(settings) {
    if (!m_host->layout()) {
        auto* layout = new QVBoxLayout(m_host);
        layout->setContentsMargins(0, 0, 0, 0);
    }
}

CViewManager::~CViewManager() = default;

void CViewManager::AddPane(QWidget* pane) {
    pane->hide();
    pane->setParent(m_host);
    m_panes.push_back(pane);
}

QWidget* CViewManager::PaneByNumber(int number) const {
    return number >= 0 && number < m_panes.size() ? m_panes[number] : nullptr;
}

QString CViewManager::Subsection(const QString& section, const QString& layout) {
    return section + QLatin1Char('\\') + layout;
}

bool CViewManager::Create(const QString& section, const QString& defaultLayout, QString& error) {
    const QString last = m_settings.GetProfileString(section, kLastLayout, defaultLayout);
    if (ApplyStoredLayout(Subsection(section, last), last, error)) {
        return true;
    }
    // A damaged stored layout must not keep the program from starting.
    return last != defaultLayout &&
           ApplyStoredLayout(Subsection(section, defaultLayout), defaultLayout, error);
}

bool CViewManager::ApplyStoredLayout(const QString& section, const QString& defaultLayout,
                                     QString& error) {
    const QString layout = m_settings.GetProfileString(section, kMainString, defaultLayout);
    if (!ApplyLayout(layout, error)) {
        return false;
    }
    LoadSizes(section);
    return true;
}

bool CViewManager::ApplyLayout(const QString& layout, QString& error) {
    CLayoutParseResult parsed = ParseLayout(layout.toStdString(), PaneCount());
    if (!parsed.Ok()) {
        error = QString::fromStdString(parsed.message);
        return false;
    }
    ++m_silent;
    DetachPanes();
    m_root = std::move(parsed.root);
    if (m_root.IsPane()) {
        // A lone pane still gets a window of its own, so that it is shown.
        auto* single = new CMngrSplitter(Qt::Horizontal, kFirstPaneId);
        single->addWidget(Build(m_root, kFirstPaneId));
        m_top = single;
    } else {
        m_top = Build(m_root, kFirstPaneId);
    }
    m_host->layout()->addWidget(m_top);
    m_top->show();
    --m_silent;
    if (m_restoreLayout.isEmpty()) {
        m_restoreLayout = Compose();
    }
    return true;
}

void CViewManager::DetachPanes() {
    for (QWidget* pane : m_panes) {
        pane->hide();
        pane->setParent(m_host);
    }
    delete m_top;
    m_top = nullptr;
    m_groupWindows.clear();
}

QWidget* CViewManager::Build(const CLayoutItem& item, int controlId) {
    if (item.IsPane()) {
        QWidget* pane = m_panes[item.kind];
        pane->show();
        return pane;
    }
    const int count = static_cast<int>(item.children.size());
    if (item.IsTabular()) {
        auto* holder = new CTabViewHolder;
        m_groupWindows.push_back(holder);
        for (int i = 0; i < count; ++i) {
            const CLayoutItem& child = item.children[i];
            QWidget* page = Build(child, kFirstPaneId + i);
            holder->addTab(
                page, child.IsPane() ? page->windowTitle() : QStringLiteral("Sheet %1").arg(i + 1));
        }
        connect(holder, &QTabWidget::currentChanged, this,
                [this, holder](int index) { OnTabChanged(holder, index); });
        return holder;
    }
    const bool sideBySide = item.kind == kLayoutHorizontal;
    auto* splitter = new CMngrSplitter(sideBySide ? Qt::Horizontal : Qt::Vertical, controlId);
    m_groupWindows.push_back(splitter);
    for (int i = 0; i < count; ++i) {
        splitter->addWidget(Build(item.children[i], kFirstPaneId + (sideBySide ? i : i * 16)));
    }
    splitter->setSizes(
        EqualShares(sideBySide ? m_host->width() : m_host->height(), splitter->count()));
    return splitter;
}

QString CViewManager::Compose() const {
    return QString::fromStdString(ComposeLayout(m_root));
}

QVector<QWidget*> CViewManager::GroupWindows() const {
    return m_groupWindows;
}

void CViewManager::SaveSizes(const QString& section) {
    m_settings.WriteProfileString(section, kSizeInfoMain,
                                  QStringLiteral("%1|%2|%3")
                                      .arg(m_groupWindows.size())
                                      .arg(m_host->width())
                                      .arg(m_host->height()));
    for (int n = 0; n < m_groupWindows.size(); ++n) {
        QString text;
        if (auto* holder = qobject_cast<CTabViewHolder*>(m_groupWindows[n])) {
            text = QString::number(holder->currentIndex());
        } else if (auto* splitter = qobject_cast<CMngrSplitter*>(m_groupWindows[n])) {
            for (int size : splitter->sizes()) {
                text += QString::number(size) + QLatin1Char('|');
            }
        }
        m_settings.WriteProfileString(section, QString::fromLatin1(kLayoutItem).arg(n), text);
    }
}

void CViewManager::LoadSizes(const QString& section) {
    const QList<int> info = NumbersOf(m_settings.GetProfileString(section, kSizeInfoMain));
    if (info.size() != 3 || info.contains(0)) {
        return;
    }
    const int referenceWidth = info[1];
    const int referenceHeight = info[2];
    const int count = std::min<int>(info[0], m_groupWindows.size());
    ++m_silent;
    for (int n = 0; n < count; ++n) {
        const QList<int> stored = NumbersOf(
            m_settings.GetProfileString(section, QString::fromLatin1(kLayoutItem).arg(n)));
        if (auto* holder = qobject_cast<CTabViewHolder*>(m_groupWindows[n])) {
            if (!stored.isEmpty() && stored[0] >= 0 && stored[0] < holder->count()) {
                holder->setCurrentIndex(stored[0]);
            }
        } else if (auto* splitter = qobject_cast<CMngrSplitter*>(m_groupWindows[n])) {
            const bool sideBySide = splitter->orientation() == Qt::Horizontal;
            const int extent = sideBySide ? m_host->width() : m_host->height();
            const int reference = sideBySide ? referenceWidth : referenceHeight;
            if (stored.size() < splitter->count()) {
                continue;  // keeps its equal shares
            }
            QList<int> sizes;
            for (int i = 0; i < splitter->count(); ++i) {
                const long long scaled = static_cast<long long>(extent) * stored[i] / reference;
                sizes << std::max<int>(kMinimumMemberSize, static_cast<int>(scaled));
            }
            splitter->setSizes(sizes);
        }
    }
    --m_silent;
}

void CViewManager::Save(const QString& section) {
    if (m_maximized) {
        QString error;
        Restore(error);
    }
    const QString layout = Compose();
    m_settings.WriteProfileString(section, kLastLayout, layout);
    const QString subsection = Subsection(section, layout);
    m_settings.WriteProfileString(subsection, kMainString, layout);
    SaveSizes(subsection);
}

bool CViewManager::Maximize(const QString& layout, QString& error) {
    if (!m_maximized) {
        const QString storage = QString::fromLatin1(kDefaultStorage);
        m_settings.WriteProfileString(storage, kMainString, Compose());
        SaveSizes(storage);
        m_maximized = true;
    }
    return ApplyLayout(layout, error);
}

bool CViewManager::Restore(QString& error) {
    if (!m_maximized || m_restoreLayout.isEmpty()) {
        return true;
    }
    if (!ApplyStoredLayout(QString::fromLatin1(kDefaultStorage), m_restoreLayout, error)) {
        return false;
    }
    m_maximized = false;
    return true;
}

bool CViewManager::TuneUp(const QString& section, const QString& predefinedLayouts,
                          QString& error) {
    QStringList titles;
    for (QWidget* pane : m_panes) {
        titles << pane->windowTitle();
    }
    CViewTuneUpDlg dialog(m_root, titles, predefinedLayouts, m_host->window());
    if (dialog.exec() != QDialog::Accepted || dialog.Result().isEmpty()) {
        return true;
    }
    const QString layout = dialog.Result();
    return ApplyStoredLayout(Subsection(section, layout), layout, error);
}

void CViewManager::MakePaneVisible(QWidget* pane) {
    ++m_silent;
    for (QWidget* child = pane; child && child != m_host; child = child->parentWidget()) {
        QWidget* parent = child->parentWidget();
        auto* holder = parent ? qobject_cast<CTabViewHolder*>(parent->parentWidget()) : nullptr;
        if (holder && qobject_cast<QStackedWidget*>(parent)) {
            holder->setCurrentWidget(child);
        }
    }
    --m_silent;
}

QWidget* CViewManager::FirstPaneOf(QWidget* page) const {
    if (!page || m_panes.contains(page)) {
        return page;
    }
    if (auto* splitter = qobject_cast<QSplitter*>(page)) {
        return splitter->count() > 0 ? FirstPaneOf(splitter->widget(0)) : nullptr;
    }
    if (auto* holder = qobject_cast<QTabWidget*>(page)) {
        return holder->count() > 0 ? FirstPaneOf(holder->widget(0)) : nullptr;
    }
    return nullptr;
}

void CViewManager::OnTabChanged(CTabViewHolder* holder, int index) {
    if (m_silent > 0 || index < 0) {
        return;
    }
    if (QWidget* pane = FirstPaneOf(holder->widget(index))) {
        emit paneActivationRequested(pane);
    }
}
