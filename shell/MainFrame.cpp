#include "MainFrame.h"

#include <QApplication>
#include <QClipboard>
#include <QCloseEvent>
#include <QDir>
#include <QDragEnterEvent>
#include <QFile>
#include <QMenuBar>
#include <QMimeData>
#include <QShortcut>
#include <QStatusBar>
#include <QTemporaryDir>
#include <QToolBar>
#include <QToolButton>

#include "CommandIds.h"
#include "CommandRouter.h"
#include "CommandTable.h"
#include "PlaceholderPanes.h"
#include "QuilterApp.h"
#include "QuilterDoc.h"
#include "Settings.h"
#include "TcxMsgBox.h"
#include "ViewManager.h"
#include "print/PrintCommands.h"

namespace {

// The layout that maximises each pane, by pane number.
const char* const kMaximizedLayouts[kPaneCount] = {"[0,{(1,2),3}]", "[1,{(0,2),3}]",
                                                   "[2,{(0,1),3}]", "[3,{(0,1),2}]"};
const int kActivateIds[kPaneCount] = {ID_ACTIVATE_TEXT, ID_ACTIVATE_LIST, ID_ACTIVATE_SCHEM,
                                      ID_ACTIVATE_ALN};
const char kMaximizeText[] = "&Maximize Pane            Alt+F6 ";
const char kRestoreText[] = "&Restore Layout        Alt+F6";
// Pasted sequences go through a file of this name, in a folder made for each paste.
const char kClipboardFileName[] = "_clipseq";
constexpr qsizetype kMaxClipboardBytes = 0x7FFFFFFF;

CPrintSetup PrintSetupOf(const CPageSetup& page) {
    return PrintSetupFromStored(page.marginL, page.marginR, page.marginT, page.marginB,
                                page.isMetric != 0, page.header, page.footer, page.pageSizeX,
                                page.pageSizeY);
}

}  // namespace

CMainFrame::CMainFrame(CQuilterApp& app, CQuilterDoc& document, CSettings& settings,
                       CCommandRouter& router)
    : m_app(app), m_document(document), m_settings(settings), m_router(router) {
    setObjectName(QStringLiteral("CMainFrame"));
    setAcceptDrops(true);
    setWindowIcon(QIcon(QStringLiteral(":/icons/tiler-blocks.svg")));
}

CMainFrame::~CMainFrame() = default;

bool CMainFrame::Create(QString& error) {
    CreateMenus();
    CreateToolBars();
    statusBar()->showMessage(QString::fromLatin1(kIdleStatusText));
    connect(statusBar(), &QStatusBar::messageChanged, this, [this](const QString& text) {
        if (text.isEmpty()) {
            statusBar()->showMessage(QString::fromLatin1(kIdleStatusText));
        }
    });
    // Alt+F6 is named in the menu text itself, which changes with the state.
    auto* maximize = new QShortcut(QKeySequence(Qt::ALT | Qt::Key_F6), this);
    connect(maximize, &QShortcut::activated, this, [this] { m_router.Run(ID_SHOW_MAXIMIZED); });

    CreatePanes();
    if (!m_viewManager->Create(QString::fromLatin1(kLayoutSection),
                               QString::fromLatin1(kDefaultLayout), error)) {
        return false;
    }
    connect(qApp, &QApplication::focusChanged, this, [this](QWidget*, QWidget* now) {
        for (QWidget* widget = now; widget; widget = widget->parentWidget()) {
            if (auto* pane = qobject_cast<CPaneView*>(widget);
                pane && Pane(pane->PaneNumber()) == pane) {
                SetActivePane(pane);
                return;
            }
        }
    });
    connect(&m_broadcast, &CSelectionBroadcast::announced, this,
            [this] { ReceiveBroadcast(m_broadcast.Read()); });
    SetActivePane(m_panes[kTextPane]);
    return true;
}

void CMainFrame::CreateMenus() {
    auto add = [this](QMenu* menu, std::initializer_list<int> ids) {
        for (int id : ids) {
            if (id == 0) {
                menu->addSeparator();
            } else {
                menu->addAction(m_router.Action(id));
            }
        }
    };
    QMenu* project = menuBar()->addMenu(QStringLiteral("&Project"));
    add(project, {ID_FILE_NEW,
                  ID_FILE_OPEN,
                  ID_FILE_SAVE,
                  ID_FILE_SAVE_AS,
                  0,
                  ID_ADD_FILES,
                  ID_LOAD_LOCAL_DATABASE,
                  0,
                  ID_EXPORT_MOLECULES,
                  ID_EXPORT_MSF,
                  0,
                  ID_FILE_PAGE_SETUP,
                  ID_FILE_PRINT,
                  ID_FILE_PRINT_PREVIEW,
                  ID_FILE_EXPORT_PDF,
                  ID_FILE_PRINT_SETUP,
                  0,
                  ID_FILE_MRU_FILE1,
                  ID_FILE_MRU_FILE1 + 1,
                  ID_FILE_MRU_FILE1 + 2,
                  ID_FILE_MRU_FILE4,
                  0,
                  ID_APP_EXIT});
    QMenu* edit = menuBar()->addMenu(QStringLiteral("&Edit"));
    add(edit,
        {ID_EDIT_UNDO, 0, ID_EDIT_CUT, ID_EDIT_COPY, ID_EDIT_PASTE, ID_EDIT_DELETE, 0, ID_EDIT_FIND,
         ID_EDIT_CAMERA, 0, ID_SELECT_ALIGNED, ID_EDIT_SELECT_ALL, ID_RENAME_MOLECULE, 0});
    QMenu* setup = edit->addMenu(QStringLiteral("Set&up"));
    add(setup, {ID_SETUP_LOAD, ID_SETUP_SAVE});
    m_viewMenu = menuBar()->addMenu(QStringLiteral("&View"));
    QMenu* blocks = menuBar()->addMenu(QStringLiteral("&Blocks"));
    add(blocks, {ID_SEARCH_BLOCKS, 0, ID_DEFINE_BLOCK, ID_EDIT_BLOCK, ID_DELETE_BLOCK, 0, ID_LINK,
                 ID_UNLINK, ID_UNLINK_ALL, 0, ID_BLOCKS_SETUP});
    QMenu* window = menuBar()->addMenu(QStringLiteral("&Window"));
    add(window, {ID_VIEW_TOOLBAR, ID_VIEW_STATUS_BAR});
    QMenu* help = menuBar()->addMenu(QStringLiteral("&Help"));
    add(help, {ID_HELP_INDEX, 0, ID_APP_ABOUT});
    // Every command with keys works from anywhere in the window, menu or not.
    for (const CCommandInfo& info : CommandTable()) {
        if (!info.Keys().isEmpty()) {
            addAction(m_router.Action(info.id));
        }
    }
    for (QMenu* menu : {project, edit, setup, m_viewMenu, blocks, window, help}) {
        connect(menu, &QMenu::aboutToShow, &m_router, &CCommandRouter::UpdateAll);
    }
}

QToolBar* CMainFrame::MakeToolBar(const QString& name, std::initializer_list<int> ids) {
    QToolBar* bar = addToolBar(name);
    bar->setObjectName(name);
    bar->setIconSize(QSize(20, 20));
    for (int id : ids) {
        if (id == 0) {
            bar->addSeparator();
        } else {
            bar->addAction(m_router.Action(id));
        }
    }
    return bar;
}

void CMainFrame::CreateToolBars() {
    m_mainBar = MakeToolBar(QStringLiteral("MainTool Bar"), {ID_FILE_OPEN,
                                                             ID_FILE_SAVE,
                                                             0,
                                                             ID_ADD_FILES,
                                                             0,
                                                             ID_SEARCH_BLOCKS,
                                                             0,
                                                             ID_BLOCKS_SETUP,
                                                             0,
                                                             ID_LINK,
                                                             ID_UNLINK,
                                                             0,
                                                             ID_UNDO_LINK,
                                                             ID_REDO_LINK,
                                                             0,
                                                             ID_FILE_PRINT_PREVIEW,
                                                             ID_FILE_PRINT,
                                                             0,
                                                             ID_EDIT_CAMERA,
                                                             0,
                                                             ID_WEB_LINKS,
                                                             0,
                                                             ID_CONTEXT_HELP,
                                                             0,
                                                             ID_START_PAGE});
    auto* links = new QMenu(this);
    links->addAction(m_router.Action(ID_WEB_LINK_1));
    links->addAction(m_router.Action(ID_WEB_LINK_2));
    if (auto* button =
            qobject_cast<QToolButton*>(m_mainBar->widgetForAction(m_router.Action(ID_WEB_LINKS)))) {
        button->setMenu(links);
        button->setPopupMode(QToolButton::MenuButtonPopup);
    }
    m_paneBar = MakeToolBar(QStringLiteral("PaneToolBar"), {ID_ACTIVATE_TEXT, ID_ACTIVATE_LIST,
                                                            ID_ACTIVATE_SCHEM, ID_ACTIVATE_ALN});
    m_paneBars[kTextPane] = MakeToolBar(QStringLiteral("TextToolBar"),
                                        {ID_EXPAND_ONE_LEVEL, ID_EXPAND_BRANCH, ID_COLLAPSE_BRANCH,
                                         0, ID_EDIT_DELETE, 0, ID_EDIT_FIND});
    m_paneBars[kListPane] = MakeToolBar(QStringLiteral("ListToolBar"), {ID_EDIT_BLOCK});
    m_paneBars[kSchemPane] = MakeToolBar(QStringLiteral("SchemeToolBar"), {ID_DEFINE_BLOCK});
    m_paneBars[kAlnPane] =
        MakeToolBar(QStringLiteral("AlignToolBar"), {ID_COLOR_SETUP, ID_DEFINE_BLOCK});
    for (QToolBar* bar : m_paneBars) {
        bar->hide();
    }
}

void CMainFrame::CreatePanes() {
    auto* host = new QWidget(this);
    host->setObjectName(QStringLiteral("PaneHost"));
    setCentralWidget(host);
    m_viewManager = new CViewManager(host, m_settings, this);
    m_panes = {new CBlockTextView, new CBlockListView, new CBlockSchemView, new CBlockAlnView};
    for (CPaneView* pane : m_panes) {
        m_document.AddView(pane);
        m_viewManager->AddPane(pane);
        pane->SetActionLookup([this](int id) { return m_router.Action(id); });
        connect(pane, &CPaneView::activatePaneRequested, this, &CMainFrame::ActivatePane);
    }
    auto* text = static_cast<CBlockTextView*>(m_panes[kTextPane]);
    m_document.SetMoleculeSelection(text);
    connect(text, &CBlockTextView::selectionChanged, &m_router, &CCommandRouter::RequestUpdate);
    connect(m_viewManager, &CViewManager::paneActivationRequested, this, [this](QWidget* pane) {
        if (auto* view = qobject_cast<CPaneView*>(pane)) {
            ActivatePane(view->PaneNumber());
        }
    });
}

CPaneView* CMainFrame::Pane(int number) const {
    return number >= 0 && number < kPaneCount ? m_panes[number] : nullptr;
}

QToolBar* CMainFrame::ToolBar(const QString& name) const {
    return findChild<QToolBar*>(name, Qt::FindDirectChildrenOnly);
}

QToolBar* CMainFrame::PaneToolBarOf(int paneNumber) const {
    return paneNumber >= 0 && paneNumber < kPaneCount ? m_paneBars[paneNumber] : nullptr;
}

void CMainFrame::ActivatePane(int number) {
    CPaneView* pane = Pane(number);
    if (!pane) {
        return;
    }
    m_viewManager->MakePaneVisible(pane);
    pane->setFocus(Qt::OtherFocusReason);
    SetActivePane(pane);
}

void CMainFrame::SetActivePane(CPaneView* pane) {
    const bool changed = pane != m_activePane;
    m_activePane = pane;
    m_viewManager->MakePaneVisible(pane);
    if (changed) {
        ShowPaneToolBar();
        RebuildViewMenu();
    }
    m_router.RequestUpdate();
}

void CMainFrame::ShowPaneToolBar() {
    if (!m_toolbarsVisible || !m_activePane) {
        return;
    }
    for (int number = 0; number < kPaneCount; ++number) {
        m_paneBars[number]->setVisible(number == m_activePane->PaneNumber());
    }
}

void CMainFrame::RebuildViewMenu() {
    m_viewMenu->clear();
    if (!m_activePane) {
        return;
    }
    switch (m_activePane->PaneNumber()) {
        case kListPane:
            m_viewMenu->addAction(m_router.Action(ID_DELETE_BLOCK));
            m_viewMenu->addSeparator();
            break;
        case kAlnPane:
            m_viewMenu->addAction(m_router.Action(ID_COLOR_SETUP));
            m_viewMenu->addSeparator();
            break;
        default:
            break;
    }
    m_viewMenu->addAction(m_router.Action(ID_EDIT_PANE_LAYOUT));
    m_viewMenu->addAction(m_router.Action(ID_SHOW_MAXIMIZED));
    m_viewMenu->addSeparator();
    m_viewMenu->addAction(m_router.Action(ID_NEXT_PANE));
}

void CMainFrame::ToggleMaximized() {
    // Rebuilding moves the focus between panes: remember which one was active.
    const int active = m_activePane->PaneNumber();
    QString error;
    const bool ok =
        m_viewManager->IsMaximized()
            ? m_viewManager->Restore(error)
            : m_viewManager->Maximize(QString::fromLatin1(kMaximizedLayouts[active]), error);
    if (!ok) {
        CTcxMsgBox::Show(this, error, MB_OK | MB_ICONEXCLAMATION);
    }
    ActivatePane(active);
}

void CMainFrame::ToggleToolBars() {
    const bool show = !m_mainBar->isVisible();
    m_toolbarsVisible = show;
    m_mainBar->setVisible(show);
    m_paneBar->setVisible(show);
    if (show) {
        ShowPaneToolBar();
    } else {
        for (QToolBar* bar : m_paneBars) {
            bar->hide();
        }
    }
}

bool CMainFrame::UpdateCommand(int id, CCommandState& state) {
    for (int number = 0; number < kPaneCount; ++number) {
        if (id == kActivateIds[number]) {
            state.checked = m_activePane && m_activePane->PaneNumber() == number;
            return true;
        }
    }
    switch (id) {
        case ID_EDIT_PASTE: {
            const QMimeData* data = QApplication::clipboard()->mimeData();
            state.enabled = data && data->hasText();
            return true;
        }
        case ID_VIEW_TOOLBAR:
            state.checked = !m_mainBar->isHidden();
            return true;
        case ID_VIEW_STATUS_BAR:
            state.checked = !statusBar()->isHidden();
            return true;
        case ID_BAR_ALIGN:
            state.checked = !m_paneBars[kAlnPane]->isHidden();
            return true;
        case ID_BAR_LIST:
            state.checked = !m_paneBars[kListPane]->isHidden();
            return true;
        case ID_EDIT_PANE_LAYOUT:
            state.enabled = !m_viewManager->IsMaximized();
            return true;
        case ID_SHOW_MAXIMIZED:
            state.enabled = m_activePane != nullptr;
            state.text =
                QString::fromLatin1(m_viewManager->IsMaximized() ? kRestoreText : kMaximizeText);
            return true;
        case ID_PREV_PANE:
            state.enabled = m_activePane != nullptr;
            return true;
        case ID_BROADCAST_SELECTION:
            state.enabled = m_panes[kAlnPane]->SelectionForBroadcast().has_value();
            return true;
        case ID_FILE_PRINT:
        case ID_FILE_PRINT_PREVIEW:
        case ID_FILE_EXPORT_PDF:
            state.enabled = m_activePane && CanPrint(m_activePane->PrintableRows());
            return true;
        case ID_WEB_LINKS:
        case ID_WEB_LINK_1:
        case ID_WEB_LINK_2:
        case ID_START_PAGE:
            return true;
        default:
            return false;
    }
}

void CMainFrame::RunCommand(int id) {
    for (int number = 0; number < kPaneCount; ++number) {
        if (id == kActivateIds[number]) {
            ActivatePane(number);
            return;
        }
    }
    switch (id) {
        case ID_EDIT_PASTE:
            Paste();
            break;
        case ID_VIEW_TOOLBAR:
            ToggleToolBars();
            break;
        case ID_VIEW_STATUS_BAR:
            statusBar()->setVisible(statusBar()->isHidden());
            break;
        case ID_BAR_ALIGN:
            m_paneBars[kAlnPane]->setVisible(m_paneBars[kAlnPane]->isHidden());
            break;
        case ID_BAR_LIST:
            m_paneBars[kListPane]->setVisible(m_paneBars[kListPane]->isHidden());
            break;
        case ID_EDIT_PANE_LAYOUT: {
            const int active = m_activePane ? m_activePane->PaneNumber() : kTextPane;
            QString error;
            if (!m_viewManager->TuneUp(QString::fromLatin1(kLayoutSection),
                                       QString::fromLatin1(kPredefinedLayouts), error)) {
                CTcxMsgBox::Show(this, error, MB_OK | MB_ICONEXCLAMATION);
            }
            ActivatePane(active);
            break;
        }
        case ID_SHOW_MAXIMIZED:
            ToggleMaximized();
            break;
        case ID_PREV_PANE:
            ActivatePane((m_activePane->PaneNumber() + kPaneCount - 1) % kPaneCount);
            break;
        case ID_BROADCAST_SELECTION:
            SendBroadcast();
            break;
        case ID_FILE_PRINT:
        case ID_FILE_PRINT_PREVIEW:
        case ID_FILE_EXPORT_PDF: {
            const QString error =
                RunPrintCommand(id, this, m_app.Printer(), *m_activePane->PrintableRows(),
                                PrintSetupOf(m_settings.LoadPageSetup()), m_document.PathName());
            if (!error.isEmpty()) {
                CTcxMsgBox::Show(this, error, MB_OK | MB_ICONEXCLAMATION);
            }
            break;
        }
        case ID_WEB_LINKS:
        case ID_START_PAGE:
            m_app.OpenHelpPage(QStringLiteral("index.html"));
            break;
        case ID_WEB_LINK_1:
            m_app.OpenHelpPage(QStringLiteral("searching.html"));
            break;
        case ID_WEB_LINK_2:
            m_app.OpenHelpPage(QStringLiteral("linking.html"));
            break;
        default:
            break;
    }
}

void CMainFrame::Paste() {
    const QString text = QApplication::clipboard()->text();
    const QByteArray bytes = text.toUtf8();
    if (bytes.size() >= kMaxClipboardBytes) {
        CTcxMsgBox::Show(this, QStringLiteral("Clipboard text too large"),
                         MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    // A folder of its own per paste keeps the file name (the name of a raw sequence) and never
    // meets another program's file.
    QTemporaryDir folder(QDir::tempPath() + QStringLiteral("/tiler-blocks-XXXXXX"));
    const QString path = folder.filePath(QString::fromLatin1(kClipboardFileName));
    QFile file(path);
    if (!folder.isValid() || !file.open(QIODevice::WriteOnly) ||
        file.write(bytes) != bytes.size()) {
        return;
    }
    file.close();
    m_document.AddFiles({path});
    QFile::remove(path);
}

void CMainFrame::DropFiles(const QStringList& paths) {
    QStringList sequenceFiles;
    for (const QString& path : paths) {
        if (CQuilterDoc::IsBlockProjectFile(path)) {
            m_document.AddFiles(sequenceFiles);
            m_app.OpenDocumentFile(path);
            return;
        }
        sequenceFiles << path;
    }
    m_document.AddFiles(sequenceFiles);
}

void CMainFrame::dragEnterEvent(QDragEnterEvent* event) {
    if (event->mimeData()->hasUrls()) {
        event->acceptProposedAction();
    }
}

void CMainFrame::dropEvent(QDropEvent* event) {
    QStringList paths;
    for (const QUrl& url : event->mimeData()->urls()) {
        if (url.isLocalFile()) {
            paths << url.toLocalFile();
        }
    }
    event->acceptProposedAction();
    // Opening may ask questions: not inside the drop's own event.
    QMetaObject::invokeMethod(
        this, [this, paths] { DropFiles(paths); }, Qt::QueuedConnection);
}

void CMainFrame::SendBroadcast() {
    const int active = m_activePane ? m_activePane->PaneNumber() : -1;
    if (active != kAlnPane && active != kSchemPane) {
        return;
    }
    if (const auto selection = m_panes[kAlnPane]->SelectionForBroadcast()) {
        CBroadcastRecord record;
        record.moleculeName = selection->molecule;
        record.firstPosition = selection->first;
        record.lastPosition = selection->last - 1;
        m_broadcast.Write(record);
    }
}

void CMainFrame::ReceiveBroadcast(const CBroadcastRecord& record) {
    if (record.moleculeName.empty() || record.moleculeKind != 2 ||
        record.sender == m_broadcast.OwnSender()) {
        return;
    }
    const CResidueSelection selection{record.moleculeName, record.firstPosition,
                                      record.lastPosition + 1};
    m_panes[kAlnPane]->ShowReceivedSelection(selection);
    m_panes[kSchemPane]->ShowReceivedSelection(selection);
}

void CMainFrame::closeEvent(QCloseEvent* event) {
    if (!m_document.SaveModified()) {
        event->ignore();
        return;
    }
    m_viewManager->Save(QString::fromLatin1(kLayoutSection));
    event->accept();
}
