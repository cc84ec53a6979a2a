#include "CommandTable.h"

#include "CommandIds.h"

namespace {

// clang-format off
const QList<CCommandInfo> kCommands = {
    {ID_FILE_NEW, "&New", "Ctrl+N", "Create a new project\nNew Project", "new", false},
    {ID_FILE_OPEN, "&Open Project...", "Ctrl+O", "Open an existing project\nOpen Project", "open", false},
    {ID_FILE_SAVE, "&Save", "Ctrl+S", "Save the project\nSave", "save", false},
    {ID_FILE_SAVE_AS, "Save &As...", "", "Save the project with a new name\nSave As", "", false},
    {ID_ADD_FILES, "Add &Files...", "Ctrl+F", "Add files to the project\nAdd Files", "add-files", false},
    {ID_LOAD_LOCAL_DATABASE, "Load from Local Database", "", "Add sequences from the sequence folders of this computer\nLoad from Local Database", "", false},
    {ID_EXPORT_MOLECULES, "Export &Molecules...", "", "Write the selected molecules to a sequence file\nExport Molecules", "", false},
    {ID_EXPORT_MSF, "&Export Project to MSF...", "", "Export alignment in MSF format\nExport MSF", "", false},
    {ID_FILE_PAGE_SETUP, "Page Set&up...", "", "Change the page layout, header and footer\nPage Setup", "", false},
    {ID_FILE_PRINT, "&Print...", "Ctrl+P", "Print the active pane\nPrint", "print", false},
    {ID_FILE_PRINT_PREVIEW, "Print Pre&view", "", "Show the printed pages of the active pane\nPrint Preview", "print-preview", false},
    {ID_FILE_EXPORT_PDF, "Export to P&DF...", "", "Write the printed pages of the active pane to a PDF file\nExport to PDF", "", false},
    {ID_FILE_PRINT_SETUP, "P&rint Setup...", "", "Choose the printer and its options\nPrint Setup", "", false},
    {ID_FILE_MRU_FILE1, "Recent File", "", "Open this project\nRecent File", "", false},
    {ID_FILE_MRU_FILE1 + 1, "Recent File", "", "Open this project\nRecent File", "", false},
    {ID_FILE_MRU_FILE1 + 2, "Recent File", "", "Open this project\nRecent File", "", false},
    {ID_FILE_MRU_FILE4, "Recent File", "", "Open this project\nRecent File", "", false},
    {ID_APP_EXIT, "E&xit", "", "Quit Tiler Blocks\nExit", "", false},

    {ID_EDIT_UNDO, "&Undo", "Ctrl+Z;Alt+Backspace", "Undo the last edit\nUndo", "", false},
    {ID_EDIT_CUT, "Cu&t", "Ctrl+X;Shift+Del", "Cut the selection to the clipboard\nCut", "cut", false},
    {ID_EDIT_COPY, "&Copy", "Ctrl+C;Ctrl+Ins", "Copy the selection to the clipboard\nCopy", "copy", false},
    {ID_EDIT_PASTE, "&Paste", "Ctrl+V;Shift+Ins", "Add the sequences on the clipboard to the project\nPaste", "paste", false},
    {ID_EDIT_DELETE, "&Delete", "Del", "Delete sequence from the project\nDelete  from Project", "delete", false},
    {ID_EDIT_FIND, "&Find", "", "Find text in the text pane\nFind", "find", false},
    {ID_EDIT_CAMERA, "Ca&mera...", "", "Take a picture of the selection\nCamera", "camera", false},
    {ID_SELECT_ALIGNED, "&Select Aligned", "", "Select the molecules of the alignment\nSelect Aligned", "", false},
    {ID_EDIT_SELECT_ALL, "Select A&ll", "Ctrl+A", "Select all molecules\nSelect All", "", false},
    {ID_RENAME_MOLECULE, "Rename Molecule...", "", "Rename the selected molecule\nRename Molecule", "", false},
    {ID_SETUP_LOAD, "&Load from File...", "", "Load setup from template file\nLoad Setup", "", false},
    {ID_SETUP_SAVE, "&Save to File...", "", "Save setup to template file\nSave Setup", "", false},

    {ID_SEARCH_BLOCKS, "&Search for blocks", "", "Search selected sequences for blocks\nSearch for Blocks", "search-blocks", false},
    {ID_DEFINE_BLOCK, "De&fine block", "Ctrl+B", "Define new block\nDefine Block", "define-block", false},
    {ID_EDIT_BLOCK, "&Edit block...", "Ctrl+E", "Edit selected block\nEdit Selected Block", "edit-block", false},
    {ID_DELETE_BLOCK, "&Delete block", "", "Delete the selected blocks\nDelete Block", "", false},
    {ID_LINK, "&Link", "Ctrl+L", "Link selected area\nLink Selected Area", "link", false},
    {ID_UNLINK, "U&nlink", "Ctrl+U", "Unlink selected area\nUnlink Selected Area", "unlink", false},
    {ID_UNLINK_ALL, "Unlink all", "", "Unlink all\nUnlink all", "", false},
    {ID_BLOCKS_SETUP, "Tiler Blocks Set&up...", "", "Tiler Blocks parameters setup\nTiler Blocks Setup", "setup", false},
    {ID_UNDO_LINK, "Undo Link Operation", "", "Undo link operation\nUndo Link Operation", "undo-link", false},
    {ID_REDO_LINK, "Redo Link Operation", "", "Redo link operation\nRedo Link Operation", "redo-link", false},

    {ID_VIEW_TOOLBAR, "&Toolbar", "", "Show or hide the toolbars\nToggle Toolbar", "", true},
    {ID_VIEW_STATUS_BAR, "&Status Bar", "", "Show or hide the status bar\nToggle Status Bar", "", true},
    {ID_HELP_INDEX, "Qarbo &Help...", "", "Open the Tiler Blocks manual\nHelp", "", false},
    {ID_CONTEXT_HELP, "What's This?", "", "Show help for the item clicked next\nHelp", "context-help", false},
    {ID_APP_ABOUT, "&About Tiler Blocks...", "", "Show the version of Tiler Blocks\nAbout", "", false},

    {ID_ACTIVATE_TEXT, "Text Pane", "", "Activate the text pane\nText Pane", "pane-text", true},
    {ID_ACTIVATE_LIST, "Block List Pane", "", "Activate the block list pane\nBlock List Pane", "pane-list", true},
    {ID_ACTIVATE_SCHEM, "Schematic Pane", "", "Activate the schematic pane\nSchematic Pane", "pane-schem", true},
    {ID_ACTIVATE_ALN, "Alignment Pane", "", "Activate the alignment pane\nAlignment Pane", "pane-aln", true},
    {ID_EDIT_PANE_LAYOUT, "Edit &Pane Layout...", "", "Edit view layout properties", "", false},
    {ID_SHOW_MAXIMIZED, "&Show Maximized", "", "Maximize the active pane, or restore the layout\nShow Maximized", "", false},
    {ID_NEXT_PANE, "Next Pane", "F6", "Switch to the next pane\nNext Pane", "", false},
    {ID_PREV_PANE, "Previous Pane", "Shift+F6", "Switch back to the previous pane\nPrevious Pane", "", false},
    {ID_COLOR_SETUP, "Color Setup...", "", "Choose the colours of the alignment\nColor Setup", "color-setup", false},
    {ID_BROADCAST_SELECTION, "&Broadcast Selection", "", "Send the selected residues to the other programs\nBroadcast Selection", "", false},
    {ID_ADD_SEQUENCE, "Add Sequence", "", "Add a sequence to the project\nAdd Sequence", "", false},
    {ID_TOGGLE_FOLDER, "&Toggle Folder", "", "Expand or collapse the folder\nToggle Folder", "", false},
    {ID_EXPAND_ONE_LEVEL, "&Expand One Level", "", "Expand the folder one level\nExpand One Level", "expand-one-level", false},
    {ID_EXPAND_BRANCH, "Expand &Branch", "", "Expand the folder and all folders in it\nExpand Branch", "expand-branch", false},
    {ID_COLLAPSE_AROUND, "Collapse A&round", "", "Collapse the folders around the focus\nCollapse Around", "", false},
    {ID_COLLAPSE_BRANCH, "&Collapse Branch", "", "Collapse the folder and all folders in it\nCollapse Branch", "collapse-branch", false},
    {ID_SELECT_FOLDER, "Select &Folder", "", "Select the folder with its content\nSelect Folder", "", false},
    {ID_WEB_LINKS, "Web Links", "", "Open the Tiler Blocks manual\nWeb Links", "web-links", false},
    {ID_WEB_LINK_1, "Searching for Blocks", "", "Open the manual's chapter on block searches\nSearching for Blocks", "", false},
    {ID_WEB_LINK_2, "Linking and Export", "", "Open the manual's chapter on linking and export\nLinking and Export", "", false},
    {ID_START_PAGE, "Start Page", "", "Open the start page of the manual\nStart Page", "start-page", false},
    {ID_BAR_ALIGN, "Alignment Toolbar", "", "Show or hide the alignment toolbar\nAlignment Toolbar", "", true},
    {ID_BAR_LIST, "List Toolbar", "", "Show or hide the block list toolbar\nList Toolbar", "", true},
    {ID_BAR_LINKS, "Links Toolbar", "", "Show or hide the links toolbar\nLinks Toolbar", "", true},
};
// clang-format on

}  // namespace

QList<QKeySequence> CCommandInfo::Keys() const {
    QList<QKeySequence> sequences;
    for (const QString& key :
         QString::fromLatin1(keys).split(QLatin1Char(';'), Qt::SkipEmptyParts)) {
        sequences << QKeySequence::fromString(key, QKeySequence::PortableText);
    }
    return sequences;
}

QString CCommandInfo::StatusText() const {
    return QString::fromLatin1(prompt).section(QLatin1Char('\n'), 0, 0);
}

QString CCommandInfo::ToolTip() const {
    const QString text = QString::fromLatin1(prompt);
    return text.contains(QLatin1Char('\n')) ? text.section(QLatin1Char('\n'), 1) : QString();
}

QString CCommandInfo::IconPath() const {
    return *icon ? QStringLiteral(":/icons/%1.svg").arg(QString::fromLatin1(icon)) : QString();
}

const QList<CCommandInfo>& CommandTable() {
    return kCommands;
}

const CCommandInfo* FindCommand(int id) {
    for (const CCommandInfo& info : kCommands) {
        if (info.id == id) {
            return &info;
        }
    }
    return nullptr;
}
