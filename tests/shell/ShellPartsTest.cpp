#include <gtest/gtest.h>

#include <QApplication>
#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QSet>
#include <QSharedMemory>
#include <QStandardPaths>
#include <QTest>
#include <QTextBrowser>
#include <cstring>

#include "CommandIds.h"
#include "CommandRouter.h"
#include "CommandTable.h"
#include "FileTypes.h"
#include "HelpModule.h"
#include "PageSetupDlg.h"
#include "QtPrinters.h"
#include "SelectionBroadcast.h"
#include "Settings.h"
#include "TcxMsgBox.h"
#include "print/HeaderFooter.h"

namespace {

// A command target that answers a fixed set of ids and records what it ran.
struct FakeTarget : ICommandTarget {
    QSet<int> answers;
    bool enabled = true;
    QList<int> ran;
    bool UpdateCommand(int id, CCommandState& state) override {
        state.enabled = enabled;
        return answers.contains(id);
    }
    void RunCommand(int id) override { ran << id; }
};

TEST(CommandTable, IdsAndKeysAreUnique) {
    QSet<int> ids;
    QSet<QString> keys;
    for (const CCommandInfo& info : CommandTable()) {
        EXPECT_FALSE(ids.contains(info.id)) << info.id;
        ids.insert(info.id);
        EXPECT_FALSE(info.StatusText().isEmpty()) << info.id;
        for (const QKeySequence& key : info.Keys()) {
            EXPECT_FALSE(key.isEmpty()) << info.keys;
            EXPECT_FALSE(keys.contains(key.toString())) << info.keys;
            keys.insert(key.toString());
        }
    }
    // The tooltip is the part after the line end; a prompt without one has none.
    EXPECT_EQ(FindCommand(ID_ADD_FILES)->StatusText(), QStringLiteral("Add files to the project"));
    EXPECT_EQ(FindCommand(ID_ADD_FILES)->ToolTip(), QStringLiteral("Add Files"));
    EXPECT_TRUE(FindCommand(ID_EDIT_PANE_LAYOUT)->ToolTip().isEmpty());
    EXPECT_EQ(FindCommand(ID_EDIT_UNDO)->Keys().size(), 2);
}

TEST(CommandRouter, AsksTheChainInOrderAndRunsOnlyEnabledCommands) {
    FakeTarget pane, document, frame;
    pane.answers = {ID_EDIT_COPY};
    document.answers = {ID_EDIT_COPY, ID_SEARCH_BLOCKS};
    frame.answers = {ID_EDIT_PASTE};
    frame.enabled = false;
    CCommandRouter router;
    router.SetChain([&]() -> std::vector<ICommandTarget*> {
        return {nullptr, &pane, &document, &frame};
    });

    EXPECT_TRUE(router.Run(ID_EDIT_COPY));
    EXPECT_EQ(pane.ran, QList<int>{ID_EDIT_COPY});
    EXPECT_TRUE(document.ran.isEmpty());
    EXPECT_TRUE(router.Run(ID_SEARCH_BLOCKS));
    EXPECT_EQ(document.ran, QList<int>{ID_SEARCH_BLOCKS});
    EXPECT_FALSE(router.Run(ID_EDIT_PASTE));  // answered but disabled
    EXPECT_FALSE(router.Run(ID_LINK));        // nobody answers
    EXPECT_TRUE(frame.ran.isEmpty());

    QAction* paste = router.Action(ID_EDIT_PASTE);
    QAction* link = router.Action(ID_LINK);
    router.UpdateAll();
    EXPECT_FALSE(paste->isEnabled());
    EXPECT_FALSE(link->isEnabled());
    frame.enabled = true;
    router.UpdateAll();
    EXPECT_TRUE(paste->isEnabled());
    EXPECT_EQ(paste->shortcuts().size(), 2);
    EXPECT_EQ(paste->statusTip(),
              QStringLiteral("Add the sequences on the clipboard to the project"));
}

TEST(TcxMsgBox, ChoosesButtonsAndIconsFromTheType) {
    EXPECT_EQ(CTcxMsgBox::ButtonTextsFor(MB_OK), QStringList{"Ok"});
    EXPECT_EQ(CTcxMsgBox::ButtonTextsFor(MB_YESNO | MB_ICONQUESTION), (QStringList{"Yes", "No"}));
    EXPECT_EQ(CTcxMsgBox::ButtonTextsFor(MB_YESNOCANCEL), (QStringList{"Yes", "No", "Cancel"}));
    EXPECT_EQ(CTcxMsgBox::IconFor(MB_OK | MB_ICONASTERISK), QMessageBox::Information);
    EXPECT_EQ(CTcxMsgBox::IconFor(MB_YESNO | MB_ICONQUESTION), QMessageBox::Question);
    EXPECT_EQ(CTcxMsgBox::IconFor(MB_OK | MB_ICONEXCLAMATION), QMessageBox::Warning);
    EXPECT_EQ(CTcxMsgBox::IconFor(MB_OK | MB_ICONHAND), QMessageBox::Critical);
    // Without an icon value: the program's icon for one button, an exclamation for more.
    EXPECT_EQ(CTcxMsgBox::IconFor(MB_OK), QMessageBox::NoIcon);
    EXPECT_EQ(CTcxMsgBox::IconFor(MB_YESNO), QMessageBox::Warning);

    QString seen;
    CTcxMsgBox::SetTestHook([&](const QString& text, unsigned type) {
        seen = text;
        return (type & MB_TYPEMASK) == MB_YESNO ? IDNO : IDOK;
    });
    EXPECT_EQ(CTcxMsgBox::Show(nullptr, QStringLiteral("Delete?"), MB_YESNO), IDNO);
    EXPECT_EQ(seen, QStringLiteral("Delete?"));
    CTcxMsgBox::SetTestHook(nullptr);
}

TEST(FileTypes, AddsDefaultsOnlyWhereNoneIsSet) {
    const QString existing = QStringLiteral(
        "[Added Associations]\ntext/plain=editor.desktop;\n\n[Default Applications]\n"
        "application/x-qrbo-blockpt=other.desktop\n\n[Removed Associations]\n");
    const QString updated = CFileTypes::WithDefaults(
        existing, {"application/x-qrbo-blockprj", "application/x-qrbo-blockpt"},
        "tiler-blocks.desktop");
    EXPECT_TRUE(updated.contains("application/x-qrbo-blockpt=other.desktop\n"));
    EXPECT_FALSE(updated.contains("application/x-qrbo-blockpt=tiler-blocks.desktop"));
    // The new default sits inside the defaults group, before the next group.
    const int added = updated.indexOf("application/x-qrbo-blockprj=tiler-blocks.desktop");
    EXPECT_GT(added, updated.indexOf("[Default Applications]"));
    EXPECT_LT(added, updated.indexOf("[Removed Associations]"));
    EXPECT_TRUE(updated.startsWith("[Added Associations]\ntext/plain=editor.desktop;\n"));
    // Applying it again changes nothing.
    EXPECT_EQ(CFileTypes::WithDefaults(updated, {"application/x-qrbo-blockprj"}, "x.desktop"),
              updated);
    EXPECT_EQ(CFileTypes::WithDefaults(QString(), {"a/b"}, "x.desktop"),
              QStringLiteral("[Default Applications]\na/b=x.desktop\n"));
}

TEST(FileTypes, RegistersTheDesktopEntryAndMimeTypesForTheUser) {
    const QString data = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    const QString config = QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation);
    QFile mimeApps(config + "/mimeapps.list");
    QDir().mkpath(config);
    ASSERT_TRUE(mimeApps.open(QIODevice::WriteOnly));
    mimeApps.write("[Default Applications]\napplication/x-qrbo-blockpt=mine.desktop\n");
    mimeApps.close();

    EXPECT_TRUE(CFileTypes::Register("/opt/tb/bin/tiler-blocks"));
    QFile desktop(data + "/applications/tiler-blocks.desktop");
    ASSERT_TRUE(desktop.open(QIODevice::ReadOnly));
    const QString entry = QString::fromUtf8(desktop.readAll());
    EXPECT_TRUE(entry.contains("Exec=\"/opt/tb/bin/tiler-blocks\" %f\n"));
    EXPECT_TRUE(entry.contains("MimeType=application/x-qrbo-blockprj;application/x-qrbo-blockpt;"));
    QFile mime(data + "/mime/packages/tiler-blocks.xml");
    ASSERT_TRUE(mime.open(QIODevice::ReadOnly));
    const QString xml = QString::fromUtf8(mime.readAll());
    EXPECT_TRUE(xml.contains("<glob pattern=\"*.bpr\"/>"));
    EXPECT_TRUE(xml.contains("<glob pattern=\"*.bp1\"/>"));
    ASSERT_TRUE(mimeApps.open(QIODevice::ReadOnly));
    const QString defaults = QString::fromUtf8(mimeApps.readAll());
    EXPECT_TRUE(defaults.contains("application/x-qrbo-blockpt=mine.desktop"));
    EXPECT_TRUE(defaults.contains("application/x-qrbo-blockprj=tiler-blocks.desktop"));
}

TEST(SelectionBroadcast, OwnRecordsReadAsEmptyAndSiblingRecordsArrive) {
    CSelectionBroadcast broadcast;
    CBroadcastRecord record;
    record.moleculeName = "HBA_HUMAN";
    record.firstPosition = 10;
    record.lastPosition = 42;
    ASSERT_TRUE(broadcast.Write(record));
    const CBroadcastRecord own = broadcast.Read();
    EXPECT_EQ(own.sender, broadcast.OwnSender());
    EXPECT_TRUE(own.moleculeName.empty());
    EXPECT_EQ(own.lastPosition, 42);

    // A sibling program writes the same region under its own sender id.
    QSharedMemory sibling(QString::fromLatin1(CSelectionBroadcast::kSharedMemoryName));
    ASSERT_TRUE(sibling.attach());
    record.sender = broadcast.OwnSender() + 1;
    record.moleculeName = "MYG_PHYCA";
    const std::vector<std::uint8_t> bytes = record.ToBytes();
    ASSERT_TRUE(sibling.lock());
    std::memcpy(sibling.data(), bytes.data(), bytes.size());
    sibling.unlock();
    const CBroadcastRecord received = broadcast.Read();
    EXPECT_EQ(received.moleculeName, "MYG_PHYCA");
    EXPECT_EQ(received.firstPosition, 10);
    EXPECT_EQ(received.moleculeKind, 2);
}

TEST(PageSetup, DefaultsConversionAndTheDialog) {
    CSettings settings;
    const CPageSetup defaults = settings.LoadPageSetup();
    EXPECT_EQ(defaults.marginL, 750);
    EXPECT_EQ(defaults.marginT, 500);
    EXPECT_EQ(defaults.orientation, 1);
    EXPECT_EQ(defaults.header, QStringLiteral("&D&c"));
    EXPECT_EQ(defaults.footer, QStringLiteral("&s Page &p&l"));
    // 0.75 inch is 19.05 mm.
    EXPECT_EQ(CPageSetupDlg::Convert(750, false, true), 1905);
    EXPECT_EQ(CPageSetupDlg::Convert(1905, true, false), 750);

    CPageSetupDlg dialog(defaults);
    const bool metric = CPageSetupDlg::LocaleIsMetric();
    EXPECT_NEAR(dialog.Margin(0)->value(), metric ? 19.05 : 0.75, 1e-9);
    dialog.Margin(2)->setValue(metric ? 20.0 : 1.0);
    dialog.PaperSize()->setCurrentIndex(1);  // A4
    dialog.Footer()->setText(QStringLiteral("&p"));
    const CPageSetup result = dialog.Result();
    EXPECT_EQ(result.isMetric, metric ? 1 : 0);
    EXPECT_EQ(result.marginT, metric ? 2000 : 1000);
    EXPECT_EQ(result.pageSizeX, metric ? 21000 : 8268);  // 210 mm
    EXPECT_EQ(result.footer, QStringLiteral("&p"));
    // Every code that printing understands is explained beside the fields.
    const auto* legend = dialog.findChild<QLabel*>("headerCodes");
    ASSERT_NE(legend, nullptr);
    const CPageTextContext page{QDateTime::currentDateTime(), "/data/p.bpr", 2, 3};
    int understood = 0;
    for (char code = ' '; code <= '~'; ++code) {
        const QString written = QStringLiteral("&") + QChar(code);
        if (ExpandHeaderFooter(written, page) == CPageTextParts{written, {}, {}})
            continue;  // kept as written: not a code
        ++understood;
        const QString explained = "<b>&amp;" + written.mid(1).toHtmlEscaped() + "</b>";
        EXPECT_TRUE(legend->text().contains(explained)) << written.toStdString();
    }
    EXPECT_GE(understood, 9);
    EXPECT_EQ(dialog.Header()->toolTip(), legend->text());
    settings.SavePageSetup(result);
    EXPECT_EQ(settings.LoadPageSetup().marginT, result.marginT);
    EXPECT_EQ(settings.LoadPageSetup().orientation, 1);  // written only at exit
}

// Receives the URLs the help module opens instead of a browser.
class UrlCatcher : public QObject {
    Q_OBJECT
  public:
    QList<QUrl> urls;
  public slots:
    void Open(const QUrl& url) { urls << url; }
};

QWidget* HelpWindow() {
    for (QWidget* widget : QApplication::topLevelWidgets()) {
        if (widget->objectName() == "helpWindow")
            return widget;
    }
    return nullptr;
}

// Help needs no web browser: the manual opens in the program's own window, where its links,
// Back and Find work.
TEST(HelpModule, ShowsTheManualInItsOwnWindow) {
    UrlCatcher catcher;
    QDesktopServices::setUrlHandler("file", &catcher, "Open");
    ASSERT_TRUE(CHelpModule::OpenHelpFile("QUILTER", "Tiler Blocks"));
    EXPECT_TRUE(CHelpModule::LoadedPath().contains("HelpModule"));
    EXPECT_TRUE(catcher.urls.isEmpty());
    QWidget* window = HelpWindow();
    ASSERT_NE(window, nullptr);
    EXPECT_TRUE(window->isVisible());
    auto* browser = window->findChild<QTextBrowser*>();
    ASSERT_NE(browser, nullptr);
    EXPECT_EQ(browser->documentTitle(), "Tiler Blocks manual");
    EXPECT_TRUE(browser->source().toLocalFile().endsWith("/index.html"));
    EXPECT_TRUE(browser->toPlainText().contains("A first search in five steps"));
    EXPECT_EQ(window->windowTitle(), "Tiler Blocks manual - Tiler Blocks Help");

    ASSERT_TRUE(CHelpModule::OpenHelpPage("linking.html"));
    EXPECT_EQ(HelpWindow(), window);  // one window for every page
    EXPECT_TRUE(browser->source().toLocalFile().endsWith("/linking.html"));
    ASSERT_TRUE(browser->isBackwardAvailable());
    browser->backward();
    EXPECT_TRUE(browser->source().toLocalFile().endsWith("/index.html"));
    EXPECT_FALSE(CHelpModule::OpenHelpPage("no-such-page.html"));
    EXPECT_FALSE(CHelpModule::OpenHelpPage("../../etc/passwd"));
    EXPECT_TRUE(browser->source().toLocalFile().endsWith("/index.html"));

    auto* find = window->findChild<QLineEdit*>("findField");
    ASSERT_NE(find, nullptr);
    QTest::keyClicks(find, "conserved blocks");
    QTest::keyClick(find, Qt::Key_Return);
    EXPECT_EQ(browser->textCursor().selectedText(), "conserved blocks");
    find->clear();
    QTest::keyClicks(find, "xylophone");
    QTest::keyClick(find, Qt::Key_Return);
    EXPECT_FALSE(browser->textCursor().hasSelection());
    EXPECT_EQ(find->toolTip(), "Not found on this page");
    EXPECT_TRUE(catcher.urls.isEmpty());
    QDesktopServices::unsetUrlHandler("file");
    window->close();
}

}  // namespace

#include "ShellPartsTest.moc"
