#include "QuilterApp.h"

#include <QApplication>
#include <QFileDialog>
#include <QFileInfo>
#include <QPrintDialog>
#include <QScreen>
#include <QWhatsThis>

#include "AboutDlg.h"
#include "CommandIds.h"
#include "CommandRouter.h"
#include "FileTypes.h"
#include "HelpModule.h"
#include "MainFrame.h"
#include "QuilterDoc.h"
#include "TcxMsgBox.h"

CQuilterApp::CQuilterApp()
    : m_router(std::make_unique<CCommandRouter>()),
      m_document(std::make_unique<CQuilterDoc>(m_settings)) {
    m_router->SetChain([this]() -> std::vector<ICommandTarget*> {
        return {m_frame ? m_frame->ActivePane() : nullptr, m_document.get(), m_frame.get(), this};
    });
    connect(m_document.get(), &CQuilterDoc::changed, m_router.get(),
            &CCommandRouter::RequestUpdate);
    connect(m_document.get(), &CQuilterDoc::fileUsed, this, &CQuilterApp::AddToRecentFiles);
}

CQuilterApp::~CQuilterApp() {
    // The frame's panes are views of the document: they go first.
    m_frame.reset();
}

bool CQuilterApp::InitInstance(const QStringList& arguments, bool registerFileTypes) {
    QApplication::setWindowIcon(QIcon(QStringLiteral(":/icons/tiler-blocks.svg")));
    m_recentFiles = m_settings.LoadRecentFiles();

    m_frame = std::make_unique<CMainFrame>(*this, *m_document, m_settings, *m_router);
    connect(m_document.get(), &CQuilterDoc::titleChanged, m_frame.get(),
            [this](const QString& title) { m_frame->setWindowTitle(title); });
    connect(m_document.get(), &CQuilterDoc::modifiedChanged, m_frame.get(),
            &QWidget::setWindowModified);
    QString error;
    if (!m_frame->Create(error)) {
        CTcxMsgBox::Show(nullptr, error, MB_OK | MB_ICONHAND);
        return false;
    }
    if (registerFileTypes) {
        CFileTypes::Register(QCoreApplication::applicationFilePath());
    }
    m_document->OnNewDocument();
    // Without a window manager a maximised window keeps its small size: start from the screen's.
    if (const QScreen* screen = QGuiApplication::primaryScreen()) {
        m_frame->setGeometry(screen->availableGeometry());
    }
    m_frame->showMaximized();

    const CPageSetup setup = m_settings.LoadPageSetup();
    m_printer.setPageOrientation(setup.orientation != 0 ? QPageLayout::Portrait
                                                        : QPageLayout::Landscape);
    ProcessCommandLine(arguments);
    m_router->UpdateAll();
    return true;
}

// A block project is opened; any other file is added to the new project as sequences.
void CQuilterApp::ProcessCommandLine(const QStringList& arguments) {
    if (arguments.isEmpty()) {
        return;
    }
    const QString path = arguments.front();
    if (CQuilterDoc::IsBlockProjectFile(path)) {
        OpenDocumentFile(path);
    } else {
        m_document->AddFiles({path});
    }
}

void CQuilterApp::ExitInstance() {
    m_settings.SaveOrientation(m_printer.pageLayout().orientation() == QPageLayout::Portrait ? 1
                                                                                             : 0);
    m_settings.SaveRecentFiles(m_recentFiles);
    m_settings.Sync();
}

bool CQuilterApp::NewDocument() {
    if (!m_document->SaveModified()) {
        return false;
    }
    return m_document->OnNewDocument();
}

bool CQuilterApp::OpenDocumentFile(const QString& path) {
    if (!m_document->SaveModified()) {
        return false;
    }
    return m_document->OnOpenDocument(path);
}

void CQuilterApp::AddToRecentFiles(const QString& path) {
    const QString full = QFileInfo(path).absoluteFilePath();
    m_recentFiles.removeAll(full);
    m_recentFiles.prepend(full);
    while (m_recentFiles.size() > kRecentFileCount) {
        m_recentFiles.removeLast();
    }
    m_settings.SaveRecentFiles(m_recentFiles);
    m_router->RequestUpdate();
}

void CQuilterApp::OpenWithDialog() {
    const QString path =
        QFileDialog::getOpenFileName(m_frame.get(), QStringLiteral("Open Project"), QString(),
                                     QStringLiteral("Tiler Blocks Projects (*.bpr);;All files(*)"));
    if (!path.isEmpty()) {
        OpenDocumentFile(path);
    }
}

void CQuilterApp::OpenHelp() {
    if (!CHelpModule::OpenHelpFile("QUILTER", "Tiler Blocks")) {
        CTcxMsgBox::Show(m_frame.get(), QStringLiteral("Dll Not Loaded"), MB_OK | MB_ICONHAND);
    }
}

void CQuilterApp::OpenHelpPage(const QString& page) {
    CHelpModule::OpenHelpPage(page);
}

void CQuilterApp::ShowAbout() {
    CAboutDlg dialog(m_frame.get());
    dialog.exec();
}

void CQuilterApp::PrintSetup() {
    QPrintDialog dialog(&m_printer, m_frame.get());
    dialog.setWindowTitle(QStringLiteral("Print Setup"));
    dialog.exec();
}

bool CQuilterApp::UpdateCommand(int id, CCommandState& state) {
    if (id >= ID_FILE_MRU_FILE1 && id <= ID_FILE_MRU_FILE4) {
        const int index = id - ID_FILE_MRU_FILE1;
        if (index < m_recentFiles.size()) {
            state.text = QStringLiteral("&%1 %2").arg(index + 1).arg(m_recentFiles[index]);
        } else {
            state.enabled = false;
            state.visible = index == 0;  // "Recent File", greyed, stands for an empty list
        }
        return true;
    }
    switch (id) {
        case ID_FILE_NEW:
        case ID_FILE_OPEN:
        case ID_FILE_PRINT_SETUP:
        case ID_APP_EXIT:
        case ID_HELP_INDEX:
        case ID_CONTEXT_HELP:
        case ID_APP_ABOUT:
            return true;
        default:
            return false;
    }
}

void CQuilterApp::RunCommand(int id) {
    if (id >= ID_FILE_MRU_FILE1 && id <= ID_FILE_MRU_FILE4) {
        const QString path = m_recentFiles.value(id - ID_FILE_MRU_FILE1);
        if (!QFileInfo::exists(path)) {
            m_recentFiles.removeAll(path);
            m_settings.SaveRecentFiles(m_recentFiles);
            CTcxMsgBox::Show(m_frame.get(), QStringLiteral("File '%1' cannot be found.").arg(path),
                             MB_OK | MB_ICONEXCLAMATION);
            return;
        }
        OpenDocumentFile(path);
        return;
    }
    switch (id) {
        case ID_FILE_NEW:
            NewDocument();
            break;
        case ID_FILE_OPEN:
            OpenWithDialog();
            break;
        case ID_FILE_PRINT_SETUP:
            PrintSetup();
            break;
        case ID_APP_EXIT:
            m_frame->close();
            break;
        case ID_HELP_INDEX:
            OpenHelp();
            break;
        case ID_CONTEXT_HELP:
            QWhatsThis::enterWhatsThisMode();
            break;
        case ID_APP_ABOUT:
            ShowAbout();
            break;
        default:
            break;
    }
}
