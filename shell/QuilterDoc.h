#pragma once
// The document: owns the one block project, turns commands into project operations and tells
// the panes when the project changed. Files are read and written here, saves atomically.

#include <QList>
#include <QObject>
#include <QString>
#include <QStringList>
#include <functional>
#include <memory>

#include "CommandTarget.h"
#include "PaneView.h"

class CBlockProject;
class CSettings;
class IMoleculeSelection;
class CProgressDlg;

class CQuilterDoc : public QObject, public ICommandTarget, public IPaneDocument {
    Q_OBJECT
  public:
    // Runs a prepared progress dialog; returns its result. Tests replace it to press Cancel.
    using DialogRunner = std::function<int(CProgressDlg&)>;

    explicit CQuilterDoc(CSettings& settings, QObject* parent = nullptr);
    ~CQuilterDoc() override;

    CBlockProject* Project() const override { return m_project.get(); }
    void SetModifiedFlag(bool modified = true) override;
    bool IsModified() const { return m_modified; }
    QString PathName() const { return m_pathName; }
    // "Untitled" or the project's file name.
    QString Title() const;

    void AddView(CPaneView* view) {
        m_views.push_back(view);
        view->SetDocument(this);
    }
    const QList<CPaneView*>& Views() const { return m_views; }
    void SetMoleculeSelection(IMoleculeSelection* selection) { m_selection = selection; }
    void UpdateAllViews(CPaneView* sender = nullptr, int hint = kHintAll);

    bool OnNewDocument();
    // Opens a block project; a file that is none leaves the current project as it was.
    bool OnOpenDocument(const QString& path);
    bool OnSaveDocument(const QString& path);
    // Saves under `path`, or asks for a name when it is empty.
    bool DoSave(const QString& path);
    // Offers to save a modified project; false when the user cancelled.
    bool SaveModified();

    // Adds sequence files in order; returns whether any was added.
    bool AddFiles(const QStringList& paths);
    // Searches the selected molecules through the progress dialog; true when blocks were
    // installed.
    bool SearchSelected();
    void SetDialogRunner(DialogRunner runner) { m_runDialog = std::move(runner); }

    // Whether a file is a block project (it begins with the project tag).
    static bool IsBlockProjectFile(const QString& path);

    bool UpdateCommand(int id, CCommandState& state) override;
    void RunCommand(int id) override;

  signals:
    // The project or its file changed: commands may change their state.
    void changed();
    void titleChanged(const QString& windowTitle);
    // The project now differs from its file (or no longer does).
    void modifiedChanged(bool modified);
    // A project file was opened or saved (for the recent-file list).
    void fileUsed(const QString& path);

  private:
    // A new project with the parameters of the user's "default.bp1".
    std::unique_ptr<CBlockProject> NewProject() const;
    void ReplaceProject(std::unique_ptr<CBlockProject> project);
    void SetPathName(const QString& path);
    void AddFilesWithDialog();
    void ExportMolecules();
    void ExportMsf();
    void LoadTemplate();
    void SaveTemplate();
    void PageSetup();
    void LoadFromLocalDatabase();
    void SelectAligned();
    void UnlinkAll();
    void StepLinkHistory(bool forward);
    bool HasBlockMolecules() const;
    bool HasLinks() const;
    int SelectedCount() const;
    QWidget* DialogParent() const;

    CSettings& m_settings;
    std::unique_ptr<CBlockProject> m_project;
    QList<CPaneView*> m_views;
    IMoleculeSelection* m_selection = nullptr;
    QString m_pathName;
    bool m_modified = false;
    DialogRunner m_runDialog;
};
