// The program as a whole on the offscreen platform: start-up, files, the search through the
// real progress dialog and its thread, saving and reopening, panes and their commands.
#include <gtest/gtest.h>

#include <QApplication>
#include <QClipboard>
#include <QDir>
#include <QDropEvent>
#include <QFile>
#include <QMenu>
#include <QMimeData>
#include <QStatusBar>
#include <QTemporaryDir>
#include <QTest>
#include <QToolBar>
#include <QUrl>
#include <QWindow>
#include <fstream>
#include <memory>

#include "BlockProject.h"
#include "CommandIds.h"
#include "CommandRouter.h"
#include "GuiPrompt.h"
#include "MainFrame.h"
#include "PlaceholderPanes.h"
#include "ProgressDlg.h"
#include "QtPrinters.h"
#include "QuilterApp.h"
#include "QuilterDoc.h"
#include "SimTool.h"
#include "TcxMsgBox.h"
#include "ViewManager.h"

namespace {

const QString kExample = QStringLiteral(TB_TEST_DATA_DIR "/../../resources/examples/globins.fa");

void Settle() {
    for (int i = 0; i < 3; ++i) {
        QApplication::sendPostedEvents();
        QApplication::processEvents();
    }
}

int CountRecords(const QString& path) {
    std::ifstream in(path.toStdString());
    int count = 0;
    for (std::string line; std::getline(in, line);) {
        count += !line.empty() && line[0] == '>';
    }
    return count;
}

std::vector<std::uint8_t> FileBytes(const QString& path) {
    QFile file(path);
    EXPECT_TRUE(file.open(QIODevice::ReadOnly)) << path.toStdString();
    const QByteArray bytes = file.readAll();
    return {bytes.begin(), bytes.end()};
}

class FrameTest : public ::testing::Test {
  protected:
    void SetUp() override {
        QSettings(QSettings::IniFormat, QSettings::UserScope, "PELLAM, INC", "QRBO 10").clear();
        CTcxMsgBox::SetTestHook([this](const QString& text, unsigned type) {
            messages << text;
            return (type & MB_TYPEMASK) == MB_OK ? IDOK : m_answer;
        });
    }
    void TearDown() override {
        if (app) {
            m_answer = IDNO;
            app->MainFrame()->close();
            app->ExitInstance();
            app.reset();
        }
        CTcxMsgBox::SetTestHook(nullptr);
        CGuiPrompt::SetRawHook(nullptr);
    }

    void Start(const QStringList& arguments = {}) {
        app = std::make_unique<CQuilterApp>();
        ASSERT_TRUE(app->InitInstance(arguments, false));
        Settle();
    }

    CQuilterDoc& Doc() { return app->Document(); }
    CMainFrame& Frame() { return *app->MainFrame(); }
    CBlockTextView& Text() { return *static_cast<CBlockTextView*>(Frame().Pane(kTextPane)); }
    CBlockListView& List() { return *static_cast<CBlockListView*>(Frame().Pane(kListPane)); }
    CCommandState State(int id) { return app->Router().Query(id); }
    bool Enabled(int id) { return State(id).enabled; }
    bool Run(int id) {
        const bool ran = app->Router().Run(id);
        Settle();
        return ran;
    }

    // Selects the first `count` molecules of the text pane.
    // The title the window system shows, with the modified mark in place.
    QString ShownTitle() { return Frame().windowHandle()->title(); }

    void SelectFirst(int count) {
        std::vector<std::string> names;
        for (int i = 0; i < count; ++i) {
            names.push_back(Doc().Project()->MoleculeAt(i)->Name());
        }
        Text().SelectMolecules(names);
    }

    std::unique_ptr<CQuilterApp> app;
    QStringList messages;
    int m_answer = IDNO;
    QTemporaryDir folder;
};

TEST_F(FrameTest, StartsWithNoSettings) {
    Start();
    EXPECT_TRUE(Frame().isVisible());
    EXPECT_EQ(ShownTitle(), QStringLiteral("Untitled - Tiler Blocks"));
    EXPECT_EQ(Frame().ViewManager().Compose(), QStringLiteral("({0,1},{2,3})"));
    EXPECT_EQ(Frame().ActivePane(), Frame().Pane(kTextPane));
    EXPECT_EQ(Doc().Project()->MoleculeCount(), 0);
    EXPECT_FALSE(Doc().IsModified());
    EXPECT_EQ(Frame().statusBar()->currentMessage(), QStringLiteral("Ready"));
    for (const char* name : {"MainTool Bar", "PaneToolBar", "TextToolBar"}) {
        EXPECT_TRUE(Frame().ToolBar(name)->isVisible()) << name;
    }
    for (const char* name : {"ListToolBar", "SchemeToolBar", "AlignToolBar"}) {
        EXPECT_FALSE(Frame().ToolBar(name)->isVisible()) << name;
    }
    EXPECT_EQ(Frame().Pane(kAlnPane)->windowTitle(), QStringLiteral("Alignment Pane"));
    EXPECT_TRUE(messages.isEmpty()) << messages.join("|").toStdString();
}

TEST_F(FrameTest, CommandsOfAnEmptyProject) {
    Start();
    for (int id : {ID_FILE_NEW, ID_FILE_OPEN, ID_FILE_SAVE, ID_ADD_FILES, ID_SETUP_LOAD,
                   ID_SETUP_SAVE, ID_FILE_PAGE_SETUP, ID_LOAD_LOCAL_DATABASE, ID_APP_ABOUT,
                   ID_EDIT_PANE_LAYOUT, ID_SHOW_MAXIMIZED, ID_NEXT_PANE, ID_WEB_LINKS}) {
        EXPECT_TRUE(Enabled(id)) << id;
    }
    for (int id :
         {ID_SEARCH_BLOCKS, ID_EXPORT_MOLECULES, ID_EXPORT_MSF, ID_SELECT_ALIGNED, ID_UNLINK_ALL,
          ID_UNDO_LINK, ID_REDO_LINK, ID_BLOCKS_SETUP, ID_DEFINE_BLOCK, ID_LINK, ID_UNLINK,
          ID_EDIT_BLOCK, ID_BROADCAST_SELECTION, ID_EDIT_SELECT_ALL, ID_FILE_MRU_FILE1}) {
        EXPECT_FALSE(Enabled(id)) << id;
    }
    QApplication::clipboard()->clear();
    EXPECT_FALSE(Enabled(ID_EDIT_PASTE));
    QApplication::clipboard()->setText(QStringLiteral(">a\nMKV\n"));
    EXPECT_TRUE(Enabled(ID_EDIT_PASTE));
    EXPECT_TRUE(State(ID_ACTIVATE_TEXT).checked);
    EXPECT_FALSE(State(ID_ACTIVATE_LIST).checked);
    EXPECT_EQ(State(ID_SHOW_MAXIMIZED).text, QStringLiteral("&Maximize Pane            Alt+F6 "));
}

TEST_F(FrameTest, OpensASequenceFileNamedOnTheCommandLine) {
    Start({kExample});
    EXPECT_EQ(Doc().Project()->MoleculeCount(), CountRecords(kExample));
    EXPECT_EQ(Text().List()->topLevelItemCount(), CountRecords(kExample));
    EXPECT_TRUE(Doc().IsModified());
    EXPECT_TRUE(Doc().PathName().isEmpty());
    // Selection drives the search command: one molecule is not enough.
    SelectFirst(1);
    EXPECT_TRUE(Enabled(ID_EXPORT_MOLECULES));
    EXPECT_FALSE(Enabled(ID_SEARCH_BLOCKS));
    SelectFirst(2);
    EXPECT_TRUE(Enabled(ID_SEARCH_BLOCKS));
    EXPECT_TRUE(Run(ID_EDIT_SELECT_ALL));
    EXPECT_EQ(Text().SelectedCount(), CountRecords(kExample));
}

TEST_F(FrameTest, SearchesThroughTheProgressDialogAndInstallsTheResult) {
    Start();
    ASSERT_TRUE(Doc().AddFiles({kExample}));
    SelectFirst(6);

    // What the engine finds for the same molecules without any window.
    CSearchJob expected = Doc().Project()->PrepareSearch([&] {
        std::vector<const CSxMolX*> molecules;
        for (int i = 0; i < 6; ++i)
            molecules.push_back(Doc().Project()->MoleculeAt(i));
        return molecules;
    }());
    ASSERT_TRUE(RunSearchJob(expected));

    int dialogs = 0;
    QString title;
    Doc().SetDialogRunner([&](CProgressDlg& dialog) {
        ++dialogs;
        title = dialog.windowTitle();
        return dialog.exec();
    });
    ASSERT_TRUE(Run(ID_SEARCH_BLOCKS));
    EXPECT_EQ(dialogs, 1);
    EXPECT_EQ(title, QStringLiteral("Block search progress"));
    const CSimBlockSet& blocks = Doc().Project()->BlockSet();
    ASSERT_GT(blocks.BlockCount(), 0);
    ASSERT_EQ(blocks.BlockCount(), expected.result.BlockCount());
    for (int i = 0; i < blocks.BlockCount(); ++i) {
        EXPECT_EQ(blocks.BlockAt(i)->Width(CSimBlock::kCurrent),
                  expected.result.BlockAt(i)->Width(CSimBlock::kCurrent));
        EXPECT_EQ(blocks.BlockAt(i)->Score(CSimBlock::kCurrent),
                  expected.result.BlockAt(i)->Score(CSimBlock::kCurrent));
    }
    EXPECT_EQ(blocks.MoleculeCount(), 6);
    EXPECT_EQ(List().Table()->rowCount(), blocks.BlockCount());
    EXPECT_EQ(List().Table()->item(0, 3)->text(),
              QString::number(blocks.BlockAt(0)->Width(CSimBlock::kCurrent)));
    EXPECT_TRUE(Doc().IsModified());

    for (int id : {ID_EXPORT_MSF, ID_SELECT_ALIGNED, ID_SEARCH_BLOCKS}) {
        EXPECT_TRUE(Enabled(id)) << id;
    }
    for (int id : {ID_UNDO_LINK, ID_REDO_LINK, ID_UNLINK_ALL}) {
        EXPECT_FALSE(Enabled(id)) << id;  // one history snapshot, no links
    }
    Text().SelectMolecules({});
    EXPECT_TRUE(Run(ID_SELECT_ALIGNED));
    EXPECT_EQ(Text().SelectedCount(), 6);
}

TEST_F(FrameTest, CancelledSearchLeavesBlocksLinksAndHistoryAlone) {
    Start({kExample});
    SelectFirst(6);
    ASSERT_TRUE(Run(ID_SEARCH_BLOCKS));
    CBlockProject& project = *Doc().Project();
    ASSERT_GT(project.BlockSet().BlockCount(), 0);
    // Link the members of the first block, so that there are links and a history to keep.
    const CSimBlock& block = *project.BlockSet().BlockAt(0);
    std::vector<ALN_BSEL_ENTRY> selection;
    for (int i = 0; i < block.MemberCount(); ++i) {
        const int start = block.Start(CSimBlock::kCurrent, i);
        selection.push_back({project.BlockMoleculeAt(block.Member(i))->Name(), start,
                             start + block.Width(CSimBlock::kCurrent)});
    }
    CRecordingPrompt prompt;
    ASSERT_TRUE(project.Link(selection, prompt));
    ASSERT_TRUE(project.HasLinks());
    ASSERT_TRUE(project.CanUndo());
    const std::vector<std::uint8_t> before = project.ToBytes();
    const int historyBefore = project.History().Count();

    SelectFirst(8);
    int steps = 0;
    Doc().SetDialogRunner([&](CProgressDlg& dialog) {
        // Cancel from the worker's first step: the search stops after that pair.
        QObject::connect(
            &dialog, &CProgressDlg::stepped, &dialog,
            [&](qint64) {
                ++steps;
                dialog.RequestCancel();
            },
            Qt::DirectConnection);
        return dialog.exec();
    });
    Doc().SetModifiedFlag(false);
    EXPECT_FALSE(Doc().SearchSelected());
    EXPECT_EQ(steps, 1);
    EXPECT_EQ(Doc().Project(), &project);
    EXPECT_EQ(project.ToBytes(), before);
    EXPECT_EQ(project.History().Count(), historyBefore);
    EXPECT_TRUE(project.CanUndo());
    EXPECT_FALSE(Doc().IsModified());
}

TEST_F(FrameTest, SaveNewOpenGivesBackTheSameProject) {
    Start({kExample});
    SelectFirst(5);
    ASSERT_TRUE(Run(ID_SEARCH_BLOCKS));
    const QString path = folder.filePath("globins.bpr");
    ASSERT_TRUE(Doc().DoSave(path));
    EXPECT_FALSE(Doc().IsModified());
    EXPECT_EQ(ShownTitle(), QStringLiteral("globins.bpr - Tiler Blocks"));
    const std::vector<std::uint8_t> saved = FileBytes(path);
    const int molecules = Doc().Project()->MoleculeCount();
    const int blocks = Doc().Project()->BlockSet().BlockCount();

    ASSERT_TRUE(Run(ID_FILE_NEW));
    EXPECT_EQ(Doc().Project()->MoleculeCount(), 0);
    EXPECT_EQ(List().Table()->rowCount(), 0);
    EXPECT_EQ(Text().List()->topLevelItemCount(), 0);

    ASSERT_TRUE(app->OpenDocumentFile(path));
    EXPECT_EQ(Doc().Project()->MoleculeCount(), molecules);
    EXPECT_EQ(Doc().Project()->BlockSet().BlockCount(), blocks);
    EXPECT_EQ(List().Table()->rowCount(), blocks);
    EXPECT_EQ(Doc().Project()->ToBytes(), saved);
    EXPECT_FALSE(Enabled(ID_UNDO_LINK));
    EXPECT_EQ(app->RecentFiles().value(0), QFileInfo(path).absoluteFilePath());
    EXPECT_EQ(State(ID_FILE_MRU_FILE1).text, "&1 " + QFileInfo(path).absoluteFilePath());
    EXPECT_TRUE(messages.isEmpty()) << messages.join("|").toStdString();

    // A file that is no project leaves the project and its file name alone.
    EXPECT_FALSE(app->OpenDocumentFile(kExample));
    EXPECT_EQ(Doc().PathName(), QFileInfo(path).absoluteFilePath());
    EXPECT_EQ(Doc().Project()->BlockSet().BlockCount(), blocks);
}

// The title carries the modified mark exactly while the project differs from its file.
TEST_F(FrameTest, TitleShowsTheModifiedMark) {
    Start({kExample});
    EXPECT_EQ(ShownTitle(), QStringLiteral("Untitled* - Tiler Blocks"));
    const QString path = folder.filePath("globins.bpr");
    ASSERT_TRUE(Doc().DoSave(path));
    EXPECT_EQ(ShownTitle(), QStringLiteral("globins.bpr - Tiler Blocks"));
    SelectFirst(5);
    ASSERT_TRUE(Run(ID_SEARCH_BLOCKS));
    EXPECT_EQ(ShownTitle(), QStringLiteral("globins.bpr* - Tiler Blocks"));
    ASSERT_TRUE(Run(ID_FILE_SAVE));
    EXPECT_EQ(ShownTitle(), QStringLiteral("globins.bpr - Tiler Blocks"));
    EXPECT_FALSE(Doc().IsModified());
    // Another project replaces the mark with its own state.
    ASSERT_TRUE(Doc().AddFiles({kExample}));
    EXPECT_EQ(ShownTitle(), QStringLiteral("globins.bpr* - Tiler Blocks"));
    m_answer = IDNO;
    ASSERT_TRUE(Run(ID_FILE_NEW));
    EXPECT_EQ(ShownTitle(), QStringLiteral("Untitled - Tiler Blocks"));
}

TEST_F(FrameTest, AsksBeforeDroppingChangesAndHonoursCancel) {
    Start({kExample});
    ASSERT_TRUE(Doc().IsModified());
    m_answer = IDCANCEL;
    EXPECT_FALSE(Run(ID_FILE_NEW) && Doc().Project()->MoleculeCount() == 0);
    EXPECT_EQ(messages.value(0), QStringLiteral("Save changes to Untitled?"));
    EXPECT_GT(Doc().Project()->MoleculeCount(), 0);
    m_answer = IDNO;
    EXPECT_TRUE(Run(ID_FILE_NEW));
    EXPECT_EQ(Doc().Project()->MoleculeCount(), 0);
}

TEST_F(FrameTest, DropsTwoSequenceFilesAndThenOpensAProject) {
    Start({kExample});
    SelectFirst(3);
    ASSERT_TRUE(Run(ID_SEARCH_BLOCKS));
    const QString project = folder.filePath("dropped.bpr");
    ASSERT_TRUE(Doc().DoSave(project));
    ASSERT_TRUE(Run(ID_FILE_NEW));

    const QString first = folder.filePath("a.fa");
    const QString second = folder.filePath("b.fa");
    for (const auto& [path, text] : {std::pair{first, ">one\nMKVLAAGIVGLLLAA\n"},
                                     std::pair{second, ">two\nMSTLLKKAAGHIVEE\n"}}) {
        QFile file(path);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(text);
    }
    // The two sequence files alone are both added.
    auto drop = [&](const QStringList& paths) {
        QMimeData data;
        QList<QUrl> urls;
        for (const QString& path : paths)
            urls << QUrl::fromLocalFile(path);
        data.setUrls(urls);
        // A drop goes to the widget that accepted the drag's entry.
        QDragEnterEvent enter(QPoint(10, 10), Qt::CopyAction, &data, Qt::LeftButton,
                              Qt::NoModifier);
        QApplication::sendEvent(&Frame(), &enter);
        ASSERT_TRUE(enter.isAccepted());
        QDropEvent event(QPointF(10, 10), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(&Frame(), &event);
        Settle();
    };
    drop({first, second});
    ASSERT_EQ(Doc().Project()->MoleculeCount(), 2) << messages.join("|").toStdString();
    EXPECT_EQ(Doc().Project()->MoleculeAt(1)->Name(), "two");

    ASSERT_TRUE(Run(ID_FILE_NEW));
    messages.clear();
    drop({first, second, project});
    // Adding made the new project modified, so opening the project asked about it first.
    EXPECT_EQ(messages, QStringList{"Save changes to Untitled?"});
    EXPECT_EQ(Doc().PathName(), QFileInfo(project).absoluteFilePath());
    EXPECT_EQ(Doc().Project()->MoleculeCount(), CountRecords(kExample));
}

TEST_F(FrameTest, PastesSequencesThroughAUniqueTemporaryFile) {
    Start();
    QApplication::clipboard()->setText(
        QStringLiteral(">pasted1\nMKVLAAGIVG\n>pasted2\nMSTLLKKAAG\n"));
    ASSERT_TRUE(Run(ID_EDIT_PASTE));
    ASSERT_EQ(Doc().Project()->MoleculeCount(), 2) << messages.join("|").toStdString();
    EXPECT_EQ(Doc().Project()->MoleculeAt(0)->Name(), "pasted1");
    EXPECT_TRUE(QDir::temp().entryList({"tiler-blocks-*"}).isEmpty());

    // Raw text asks what it is; the molecule is named after the file.
    std::string asked;
    CGuiPrompt::SetRawHook([&](const std::string& path, int) {
        asked = path;
        return int(kTypeProtein);
    });
    QApplication::clipboard()->setText(QStringLiteral("MKVLAAGIVGLLLAA\n"));
    ASSERT_TRUE(Run(ID_EDIT_PASTE));
    EXPECT_TRUE(QString::fromStdString(asked).endsWith("/_clipseq"));
    ASSERT_EQ(Doc().Project()->MoleculeCount(), 3);
    EXPECT_EQ(Doc().Project()->MoleculeAt(2)->Name(), "_clipseq");
}

TEST_F(FrameTest, PanesCycleAndCarryTheirToolbarsAndViewMenus) {
    Start();
    EXPECT_EQ(State(ID_NEXT_PANE).text, QStringLiteral("Activate Block List Pane"));
    ASSERT_TRUE(Run(ID_NEXT_PANE));
    EXPECT_EQ(Frame().ActivePane(), Frame().Pane(kListPane));
    EXPECT_TRUE(Frame().ToolBar("ListToolBar")->isVisible());
    EXPECT_FALSE(Frame().ToolBar("TextToolBar")->isVisible());
    EXPECT_TRUE(State(ID_ACTIVATE_LIST).checked);
    EXPECT_EQ(Frame().ViewMenu()->actions().value(0)->data().toInt(), ID_DELETE_BLOCK);
    EXPECT_EQ(State(ID_NEXT_PANE).text, QStringLiteral("Activate Schematic Pane"));
    ASSERT_TRUE(Run(ID_ACTIVATE_ALN));
    EXPECT_EQ(Frame().ViewMenu()->actions().value(0)->data().toInt(), ID_COLOR_SETUP);
    EXPECT_EQ(State(ID_NEXT_PANE).text, QStringLiteral("Activate Text Pane"));
    ASSERT_TRUE(Run(ID_PREV_PANE));
    EXPECT_EQ(Frame().ActivePane(), Frame().Pane(kSchemPane));
    EXPECT_EQ(Frame().ViewMenu()->actions().value(0)->data().toInt(), ID_EDIT_PANE_LAYOUT);

    // Hidden toolbars stay hidden while panes change; shown again, only the active pane's bar.
    ASSERT_TRUE(Run(ID_VIEW_TOOLBAR));
    EXPECT_FALSE(State(ID_VIEW_TOOLBAR).checked);
    ASSERT_TRUE(Run(ID_ACTIVATE_TEXT));
    for (const char* name : {"MainTool Bar", "PaneToolBar", "TextToolBar", "SchemeToolBar"}) {
        EXPECT_FALSE(Frame().ToolBar(name)->isVisible()) << name;
    }
    ASSERT_TRUE(Run(ID_VIEW_TOOLBAR));
    EXPECT_TRUE(Frame().ToolBar("MainTool Bar")->isVisible());
    EXPECT_TRUE(Frame().ToolBar("TextToolBar")->isVisible());
    EXPECT_FALSE(Frame().ToolBar("SchemeToolBar")->isVisible());
}

TEST_F(FrameTest, KeysReachThePaneCommands) {
    Start();
    Frame().activateWindow();
    Frame().Pane(kTextPane)->setFocus();
    Settle();
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_F6);
    Settle();
    EXPECT_EQ(Frame().ActivePane(), Frame().Pane(kListPane));
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_F6, Qt::AltModifier);
    Settle();
    EXPECT_EQ(Frame().ViewManager().Compose(), QStringLiteral("[1,{(0,2),3}]"));
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_F6, Qt::ShiftModifier);
    Settle();
    EXPECT_EQ(Frame().ActivePane(), Frame().Pane(kTextPane));
}

TEST_F(FrameTest, MaximisesTheActivePaneAndRestoresTheLayout) {
    Start();
    ASSERT_TRUE(Run(ID_ACTIVATE_SCHEM));
    ASSERT_TRUE(Run(ID_SHOW_MAXIMIZED));
    EXPECT_EQ(Frame().ViewManager().Compose(), QStringLiteral("[2,{(0,1),3}]"));
    EXPECT_EQ(State(ID_SHOW_MAXIMIZED).text, QStringLiteral("&Restore Layout        Alt+F6"));
    EXPECT_FALSE(Enabled(ID_EDIT_PANE_LAYOUT));
    EXPECT_EQ(Frame().ActivePane(), Frame().Pane(kSchemPane));
    EXPECT_TRUE(Frame().Pane(kSchemPane)->isVisible());
    // Activating a pane on the other tab brings that tab forward.
    ASSERT_TRUE(Run(ID_ACTIVATE_ALN));
    EXPECT_TRUE(Frame().Pane(kAlnPane)->isVisible());
    EXPECT_FALSE(Frame().Pane(kSchemPane)->isVisible());
    ASSERT_TRUE(Run(ID_SHOW_MAXIMIZED));
    EXPECT_EQ(Frame().ViewManager().Compose(), QStringLiteral("({0,1},{2,3})"));
    EXPECT_TRUE(Enabled(ID_EDIT_PANE_LAYOUT));
    for (int pane = 0; pane < kPaneCount; ++pane) {
        EXPECT_TRUE(Frame().Pane(pane)->isVisible()) << pane;
    }
}

TEST_F(FrameTest, TheLastLayoutComesBackAtTheNextStart) {
    Start();
    QString error;
    ASSERT_TRUE(Frame().ViewManager().ApplyLayout(QStringLiteral("[0,{(1,2),3}]"), error));
    ASSERT_TRUE(Run(ID_ACTIVATE_ALN));
    Frame().close();
    app->ExitInstance();
    app.reset();
    Start();
    EXPECT_EQ(Frame().ViewManager().Compose(), QStringLiteral("[0,{(1,2),3}]"));
    // A layout that no longer parses falls back to the standard one.
    Frame().close();
    app->ExitInstance();
    app.reset();
    CSettings().WriteProfileString("QuilterMainWnd", "LastLayout", "(0,4)");
    Start();
    EXPECT_EQ(Frame().ViewManager().Compose(), QStringLiteral("({0,1},{2,3})"));
}

}  // namespace
