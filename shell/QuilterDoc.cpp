#include "QuilterDoc.h"

#include <QApplication>
#include <QCursor>
#include <QDir>
#include <QFileDialog>
#include <QFileInfo>
#include <QStandardPaths>

#include "BlockProject.h"
#include "CommandIds.h"
#include "DeskTopSimTool.h"
#include "GuiPrompt.h"
#include "MoleculeSelection.h"
#include "PageSetupDlg.h"
#include "ProgressDlg.h"
#include "SafeSave.h"
#include "Settings.h"
#include "TcxMsgBox.h"
#include "archive/FileIO.h"
#include "export/SequenceWriters.h"

namespace {

const char kProjectFilter[] = "Tiler Blocks Projects (*.bpr)";
const char kTemplateFilters[] = "Tiler Blocks templates(*.bp1);;All files(*.*)";

// The message of a failed save, with the system's reason on its own line.
QString SaveFailureText(const QString& message, const QString& reason) {
    return reason.isEmpty() ? message : message + QLatin1Char('\n') + reason;
}

}  // namespace

std::unique_ptr<CBlockProject> CQuilterDoc::NewProject() const {
    return std::make_unique<CBlockProject>(m_settings.UserSettingsDir().toStdString());
}

CQuilterDoc::CQuilterDoc(CSettings& settings, QObject* parent)
    : QObject(parent), m_settings(settings), m_project(NewProject()) {
    m_runDialog = [](CProgressDlg& dialog) { return dialog.exec(); };
}

CQuilterDoc::~CQuilterDoc() = default;

QWidget* CQuilterDoc::DialogParent() const {
    return QApplication::activeWindow();
}

QString CQuilterDoc::Title() const {
    return m_pathName.isEmpty() ? QStringLiteral("Untitled") : QFileInfo(m_pathName).fileName();
}

void CQuilterDoc::SetModifiedFlag(bool modified) {
    const bool was = m_modified;
    m_modified = modified;
    if (was != modified)
        emit modifiedChanged(modified);
    emit changed();
}

void CQuilterDoc::SetPathName(const QString& path) {
    m_pathName = path.isEmpty() ? QString() : QFileInfo(path).absoluteFilePath();
    // "[*]" is where the window shows its modified mark.
    emit titleChanged(Title() + QStringLiteral("[*] - Tiler Blocks"));
    if (!m_pathName.isEmpty()) {
        emit fileUsed(m_pathName);
    }
}

void CQuilterDoc::UpdateAllViews(CPaneView* sender, int hint) {
    for (CPaneView* view : m_views) {
        if (view != sender) {
            view->OnUpdate(sender, hint);
        }
    }
    emit changed();
}

void CQuilterDoc::ReplaceProject(std::unique_ptr<CBlockProject> project) {
    for (CPaneView* view : m_views) {
        view->ResetContents();
    }
    m_project = std::move(project);
    UpdateAllViews();
}

bool CQuilterDoc::OnNewDocument() {
    ReplaceProject(NewProject());
    SetPathName(QString());
    SetModifiedFlag(false);
    return true;
}

bool CQuilterDoc::IsBlockProjectFile(const QString& path) {
    return CMolList::ClassifyFile(path.toStdString()) == 1;
}

bool CQuilterDoc::OnOpenDocument(const QString& path) {
    // Anything but a block project leaves the current project and its file name alone, so that
    // a later save cannot write the project over that file.
    if (!IsBlockProjectFile(path)) {
        return false;
    }
    QApplication::setOverrideCursor(Qt::WaitCursor);
    std::unique_ptr<CBlockProject> loaded;
    QString error;
    try {
        loaded = CBlockProject::Load(path.toStdString());
    } catch (const CArchiveException& exception) {
        error = QString::fromStdString(exception.Report(FileNameOf(path.toStdString())));
    } catch (const CFileException&) {
        error = QStringLiteral("Error opening '%1' file").arg(path);
    }
    QApplication::restoreOverrideCursor();
    if (!loaded) {
        CTcxMsgBox::Show(DialogParent(), error, MB_OK | MB_ICONEXCLAMATION);
        return false;
    }
    ReplaceProject(std::move(loaded));
    SetPathName(path);
    SetModifiedFlag(false);
    return true;
}

bool CQuilterDoc::OnSaveDocument(const QString& path) {
    QApplication::setOverrideCursor(Qt::WaitCursor);
    bool ok = true;
    QString reason;
    try {
        m_project->Save(path.toStdString());
    } catch (const CFileException& e) {
        ok = false;
        reason = QString::fromLocal8Bit(e.Reason());
    }
    QApplication::restoreOverrideCursor();
    if (!ok) {
        CTcxMsgBox::Show(
            DialogParent(),
            SaveFailureText(QStringLiteral("Error saving '%1' file").arg(path), reason),
            MB_OK | MB_ICONEXCLAMATION);
    }
    return ok;
}

bool CQuilterDoc::DoSave(const QString& path) {
    QString target = path;
    if (target.isEmpty()) {
        const QString suggested = m_pathName.isEmpty()
                                      ? QDir::home().filePath(QStringLiteral("Untitled.bpr"))
                                      : m_pathName;
        QFileDialog dialog(DialogParent(), QStringLiteral("Save As"), suggested,
                           QString::fromLatin1(kProjectFilter));
        dialog.setAcceptMode(QFileDialog::AcceptSave);
        dialog.setDefaultSuffix(QStringLiteral("bpr"));
        if (dialog.exec() != QDialog::Accepted) {
            return false;
        }
        target = dialog.selectedFiles().value(0);
    }
    if (target.isEmpty() || !OnSaveDocument(target)) {
        return false;
    }
    SetPathName(target);
    SetModifiedFlag(false);
    return true;
}

bool CQuilterDoc::SaveModified() {
    if (!m_modified) {
        return true;
    }
    switch (CTcxMsgBox::Show(DialogParent(), QStringLiteral("Save changes to %1?").arg(Title()),
                             MB_YESNOCANCEL | MB_ICONEXCLAMATION)) {
        case IDYES:
            return DoSave(m_pathName);
        case IDNO:
            return true;
        default:
            return false;
    }
}

bool CQuilterDoc::AddFiles(const QStringList& paths) {
    CGuiPrompt prompt(DialogParent());
    bool added = false;
    for (const QString& path : paths) {
        if (m_project->AddFile(path.toStdString(), prompt)) {
            added = true;
            SetModifiedFlag();
        }
    }
    if (added) {
        UpdateAllViews(nullptr, kHintMolecules);
    }
    return added;
}

void CQuilterDoc::AddFilesWithDialog() {
    const QStringList paths = QFileDialog::getOpenFileNames(
        DialogParent(), QStringLiteral("Add files to project"), QString(),
        QStringLiteral("All files(*.*);;Text files(*.txt)"));
    AddFiles(paths);
}

int CQuilterDoc::SelectedCount() const {
    return m_selection ? m_selection->SelectedCount() : 0;
}

bool CQuilterDoc::SearchSelected() {
    if (!m_selection) {
        return false;
    }
    std::vector<const CSxMolX*> molecules;
    for (const std::string& name : m_selection->SelectedMolecules()) {
        if (const CSxMolX* molecule = m_project->FindByName(name)) {
            molecules.push_back(molecule);
        }
    }
    CGuiPrompt prompt(DialogParent());
    const auto run = [this](CSearchJob& job) {
        CProgressDlg dialog(
            QStringLiteral("Block search progress"),
            [&job](CProgressDlg& progress) {
                CDeskTopSimTool tool(job.matrix, job.parameters, job.molecules, &job.result,
                                     progress);
                return tool.Run();
            },
            true, true, DialogParent());
        return m_runDialog(dialog) == QDialog::Accepted;
    };
    const bool installed = m_project->Search(molecules, run, prompt);
    if (installed) {
        UpdateAllViews(nullptr, kHintBlocks);
        SetModifiedFlag();
    }
    return installed;
}

bool CQuilterDoc::HasBlockMolecules() const {
    return m_project->BlockSet().MoleculeCount() > 0;
}

bool CQuilterDoc::HasLinks() const {
    return m_project->HasLinks();
}

void CQuilterDoc::SelectAligned() {
    if (!m_selection) {
        return;
    }
    std::vector<std::string> names;
    const CSimBlockSet& blocks = m_project->BlockSet();
    for (int i = 0; i < blocks.MoleculeCount(); ++i) {
        if (const CSxMolX* molecule = m_project->BlockMoleculeAt(i)) {
            names.push_back(molecule->Name());
        }
    }
    m_selection->SelectMolecules(names);
}

void CQuilterDoc::UnlinkAll() {
    m_project->UnlinkAll();
    UpdateAllViews(nullptr, kHintLinks);
    SetModifiedFlag();
}

void CQuilterDoc::StepLinkHistory(bool forward) {
    if (forward ? m_project->Redo() : m_project->Undo()) {
        UpdateAllViews(nullptr, kHintLinks);
    }
}

void CQuilterDoc::ExportMolecules() {
    const bool nucleic = m_project->MoleculeType() == kTypeNucleic;
    const QStringList filters =
        nucleic ? QStringList{"GenBank(*.gb)", "EMBL(*.txt)", "FASTA(*.txt)", "raw sequence(*.txt)"}
                : QStringList{"GenPept(*.gp)", "SWISS-PROT(*.txt)", "FASTA(*.txt)",
                              "raw sequence(*.txt)"};
    QFileDialog dialog(DialogParent(), nucleic ? QStringLiteral("Export DNA...")
                                               : QStringLiteral("Export Proteins..."));
    dialog.setAcceptMode(QFileDialog::AcceptSave);
    dialog.setNameFilters(filters);
    if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) {
        return;
    }
    const int filter = static_cast<int>(filters.indexOf(dialog.selectedNameFilter())) + 1;
    std::vector<const CSxMol*> molecules;
    for (const std::string& name : m_selection->SelectedMolecules()) {
        if (const CSxMolX* molecule = m_project->FindByName(name)) {
            molecules.push_back(molecule);
        }
    }
    const QString path = dialog.selectedFiles().front();
    QString reason;
    if (!SaveFileContents(path, ::ExportMolecules(molecules, filter), &reason)) {
        CTcxMsgBox::Show(
            DialogParent(),
            SaveFailureText(QStringLiteral("Error opening '%1' file").arg(path), reason),
            MB_OK | MB_ICONEXCLAMATION);
    }
}

void CQuilterDoc::ExportMsf() {
    CMsfExport msf = m_project->BuildMsf();
    if (!msf.IsWritable()) {
        return;
    }
    QFileDialog dialog(DialogParent(), QStringLiteral("Export MSF Format"));
    dialog.setAcceptMode(QFileDialog::AcceptSave);
    dialog.setDefaultSuffix(QStringLiteral("msf"));
    dialog.setNameFilters({"MSF projects(*.msf)", "Text files(*.txt)", "All files(*.*)"});
    if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) {
        return;
    }
    const QString path = dialog.selectedFiles().front();
    QString reason;
    if (!SaveFileContents(path, msf.Write(), &reason)) {
        CTcxMsgBox::Show(
            DialogParent(),
            SaveFailureText(QStringLiteral("Error opening '%1' file").arg(path), reason), MB_OK);
    }
}

void CQuilterDoc::LoadTemplate() {
    QFileDialog dialog(DialogParent(), QStringLiteral("Open Template"), QString(),
                       QString::fromLatin1(kTemplateFilters));
    dialog.setDefaultSuffix(QStringLiteral("bp1"));
    dialog.setFileMode(QFileDialog::ExistingFile);
    if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) {
        return;
    }
    CGuiPrompt prompt(DialogParent());
    // Whatever the file held, the parameters may have been reset: the project changed.
    m_project->Params().LoadTemplate(dialog.selectedFiles().front().toStdString(), &prompt);
    {
        SetModifiedFlag();
        UpdateAllViews(nullptr, kHintLinks);
    }
}

void CQuilterDoc::SaveTemplate() {
    QFileDialog dialog(DialogParent(), QStringLiteral("Save Template"), QString(),
                       QString::fromLatin1(kTemplateFilters));
    dialog.setAcceptMode(QFileDialog::AcceptSave);
    dialog.setDefaultSuffix(QStringLiteral("bp1"));
    if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) {
        return;
    }
    CGuiPrompt prompt(DialogParent());
    QApplication::setOverrideCursor(Qt::WaitCursor);
    m_project->Params().SaveTemplate(dialog.selectedFiles().front().toStdString(), prompt);
    QApplication::restoreOverrideCursor();
}

void CQuilterDoc::PageSetup() {
    CPageSetupDlg dialog(m_settings.LoadPageSetup(), DialogParent());
    if (dialog.exec() == QDialog::Accepted) {
        m_settings.SavePageSetup(dialog.Result());
    }
}

// The program keeps no molecule database of its own: the command offers the sequence folders
// of this computer, starting with the examples that come with the program.
void CQuilterDoc::LoadFromLocalDatabase() {
    const QString programDir = QCoreApplication::applicationDirPath();
    QString start;
    for (const QString& dir : {programDir + QStringLiteral("/../share/tiler-blocks/examples"),
                               QStandardPaths::writableLocation(QStandardPaths::HomeLocation)}) {
        if (QFileInfo(dir).isDir()) {
            start = QDir(dir).absolutePath();
            break;
        }
    }
    AddFiles(QFileDialog::getOpenFileNames(DialogParent(),
                                           QStringLiteral("Load from Local Database"), start,
                                           QStringLiteral("All files(*.*)")));
}

bool CQuilterDoc::UpdateCommand(int id, CCommandState& state) {
    switch (id) {
        case ID_FILE_SAVE:
        case ID_FILE_SAVE_AS:
        case ID_ADD_FILES:
        case ID_LOAD_LOCAL_DATABASE:
        case ID_SETUP_LOAD:
        case ID_SETUP_SAVE:
        case ID_FILE_PAGE_SETUP:
            state.enabled = m_project != nullptr;
            return true;
        case ID_SEARCH_BLOCKS:
            state.enabled = SelectedCount() >= 2;
            return true;
        case ID_EXPORT_MOLECULES:
            state.enabled = SelectedCount() > 0;
            return true;
        case ID_EXPORT_MSF:
        case ID_SELECT_ALIGNED:
            state.enabled = HasBlockMolecules();
            return true;
        case ID_UNLINK_ALL:
            state.enabled = HasLinks();
            return true;
        case ID_UNDO_LINK:
            state.enabled = m_project->CanUndo();
            return true;
        case ID_REDO_LINK:
            state.enabled = m_project->CanRedo();
            return true;
        case ID_BLOCKS_SETUP:
            state.enabled = false;
            return true;  // the sheet is not built yet
        default:
            return false;
    }
}

void CQuilterDoc::RunCommand(int id) {
    switch (id) {
        case ID_FILE_SAVE:
            DoSave(m_pathName);
            break;
        case ID_FILE_SAVE_AS:
            DoSave(QString());
            break;
        case ID_ADD_FILES:
            AddFilesWithDialog();
            break;
        case ID_LOAD_LOCAL_DATABASE:
            LoadFromLocalDatabase();
            break;
        case ID_SETUP_LOAD:
            LoadTemplate();
            break;
        case ID_SETUP_SAVE:
            SaveTemplate();
            break;
        case ID_FILE_PAGE_SETUP:
            PageSetup();
            break;
        case ID_SEARCH_BLOCKS:
            SearchSelected();
            break;
        case ID_EXPORT_MOLECULES:
            ExportMolecules();
            break;
        case ID_EXPORT_MSF:
            ExportMsf();
            break;
        case ID_SELECT_ALIGNED:
            SelectAligned();
            break;
        case ID_UNLINK_ALL:
            UnlinkAll();
            break;
        case ID_UNDO_LINK:
            StepLinkHistory(false);
            break;
        case ID_REDO_LINK:
            StepLinkHistory(true);
            break;
        default:
            break;
    }
}
