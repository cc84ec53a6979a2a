#pragma once
// The application: starts the program (settings, file types, the single document and its main
// window, the command line), answers the application's commands and shuts down in order.

#include <QObject>
#include <QPrinter>
#include <QStringList>
#include <memory>

#include "CommandTarget.h"
#include "Settings.h"

class CCommandRouter;
class CMainFrame;
class CQuilterDoc;

class CQuilterApp : public QObject, public ICommandTarget {
    Q_OBJECT
  public:
    static constexpr int kRecentFileCount = CSettings::kRecentFileCount;

    CQuilterApp();
    ~CQuilterApp() override;

    // Starts the program with its command-line arguments (without the program name).
    // `registerFileTypes` writes the desktop entry and MIME types of the user.
    bool InitInstance(const QStringList& arguments, bool registerFileTypes = true);
    // Writes what is kept at exit; the main window has saved its layout when it closed.
    void ExitInstance();

    CMainFrame* MainFrame() const { return m_frame.get(); }
    CQuilterDoc& Document() const { return *m_document; }
    CCommandRouter& Router() const { return *m_router; }
    CSettings& Settings() { return m_settings; }
    QPrinter& Printer() { return m_printer; }

    // Opens a project after asking to save the current one; false when nothing was opened.
    bool OpenDocumentFile(const QString& path);
    bool NewDocument();
    QStringList RecentFiles() const { return m_recentFiles; }
    void AddToRecentFiles(const QString& path);

    // The help module: the manual's contents, or one of its pages.
    void OpenHelp();
    void OpenHelpPage(const QString& page);

    bool UpdateCommand(int id, CCommandState& state) override;
    void RunCommand(int id) override;

  private:
    void ProcessCommandLine(const QStringList& arguments);
    void OpenWithDialog();
    void ShowAbout();
    void PrintSetup();

    CSettings m_settings;
    QPrinter m_printer;
    std::unique_ptr<CCommandRouter> m_router;
    std::unique_ptr<CQuilterDoc> m_document;
    std::unique_ptr<CMainFrame> m_frame;
    QStringList m_recentFiles;
};
