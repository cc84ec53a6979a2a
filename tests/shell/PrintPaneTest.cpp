// Printing the alignment pane: the globins printed to PDF with the pages the plan predicts, and
// the print commands of the main window with a page setup that leaves no room.
#include <gtest/gtest.h>

#include <QApplication>
#include <QPrintPreviewDialog>
#include <QPrintPreviewWidget>
#include <QPrinter>
#include <QSettings>
#include <QTemporaryDir>
#include <QTimer>

#include "AlignmentPane.h"
#include "BlockProject.h"
#include "CommandIds.h"
#include "CommandRouter.h"
#include "MainFrame.h"
#include "PrintTestHelpers.h"
#include "QtPrinters.h"
#include "QuilterApp.h"
#include "QuilterDoc.h"
#include "Settings.h"
#include "TcxMsgBox.h"
#include "print/ProjectHolder.h"
#include "print/RowsPrinter.h"

namespace {

const QString kGlobins = QStringLiteral(TB_TEST_DATA_DIR "/../../resources/examples/globins.fa");

// The globins searched, with the first block linked.
std::unique_ptr<CBlockProject> LinkedGlobins() {
    auto project = std::make_unique<CBlockProject>();
    CRecordingPrompt prompt;
    EXPECT_TRUE(project->AddFile(kGlobins.toStdString(), prompt));
    EXPECT_TRUE(project->Search(project->AllMolecules(), RunSearchJob, prompt));
    const CSimBlockSet& blocks = project->BlockSet();
    EXPECT_GT(blocks.BlockCount(), 0);
    const CSimBlock& first = *blocks.BlockAt(0);
    std::vector<ALN_BSEL_ENTRY> selection;
    for (int member = 0; member < first.MemberCount(); ++member) {
        const int start = first.Start(CSimBlock::kCurrent, member);
        selection.push_back({blocks.MoleculeAt(first.Member(member))->Name(), start,
                             start + first.Width(CSimBlock::kCurrent)});
    }
    EXPECT_TRUE(project->Link(selection, prompt));
    return project;
}

void Settle() {
    for (int i = 0; i < 3; ++i) {
        QApplication::sendPostedEvents();
        QApplication::processEvents();
    }
}

}  // namespace

TEST(PrintPane, GlobinsPrintTheirPredictedPages) {
    CProjectHolder document(LinkedGlobins());
    CBlockAlnView pane;
    pane.SetDocument(&document);
    pane.OnUpdate(nullptr, kHintAll);
    const IPrintableRows& rows = *pane.PrintableRows();
    ASSERT_EQ(rows.PrintRowCount(), 46);  // the ruler and 45 globins

    QTemporaryDir dir;
    CPrintSetup setup = PrintSetupFromStored(750, 750, 500, 500, false, QStringLiteral("&D&c"),
                                             QStringLiteral("&s Page &p&l"));
    for (const auto orientation : {QPageLayout::Portrait, QPageLayout::Landscape}) {
        const QString path = dir.filePath(QStringLiteral("globins%1.pdf").arg(orientation));
        QPrinter printer(QPrinter::HighResolution);
        printer.setOutputFormat(QPrinter::PdfFormat);
        printer.setOutputFileName(path);
        printer.setPageSize(QPageSize(QPageSize::A4));
        printer.setPageOrientation(orientation);
        const CRowsPrinter pages(rows, setup, {QDateTime::currentDateTime(), path});

        // The plan from the page alone: A4 less 19.05 mm at the sides, 12.7 mm above and below.
        const QSizeF page =
            orientation == QPageLayout::Portrait ? QSizeF(210, 297) : QSizeF(297, 210);
        const auto bands = PageBands(page, setup);
        ASSERT_TRUE(bands);
        EXPECT_NEAR(bands->body.width, page.width() - 38.1, 1e-9);
        EXPECT_NEAR(bands->body.height, page.height() - 25.4 - 20, 1e-9);
        const CPrintPlan plan = PlanPrint(pages.Metrics(), bands->body.width, bands->body.height);
        EXPECT_GT(plan.stretchCount, 1);  // the alignment is wider than a page

        QString error;
        ASSERT_TRUE(pages.Print(printer, error)) << error.toStdString();
        EXPECT_EQ(PdfPageCount(path), plan.pageCount) << orientation;
    }
}

class PrintCommandTest : public ::testing::Test {
  protected:
    static void ClearSettings() {
        QSettings(QSettings::IniFormat, QSettings::UserScope, "PELLAM, INC", "QRBO 10").clear();
    }
    void SetUp() override {
        ClearSettings();
        CTcxMsgBox::SetTestHook([this](const QString& text, unsigned) {
            messages << text;
            return IDOK;
        });
    }
    void TearDown() override {
        if (app) {
            app->Document().SetModifiedFlag(false);
            app->MainFrame()->close();
            app->ExitInstance();
        }
        CTcxMsgBox::SetTestHook(nullptr);
        // Later tests expect the default page setup.
        ClearSettings();
    }
    void Start(const QStringList& arguments) {
        app = std::make_unique<CQuilterApp>();
        ASSERT_TRUE(app->InitInstance(arguments, false));
        Settle();
    }
    bool Enabled(int id) { return app->Router().Query(id).enabled; }

    std::unique_ptr<CQuilterApp> app;
    QStringList messages;
};

TEST_F(PrintCommandTest, PrintingNeedsAPaneWithRows) {
    Start({});
    app->MainFrame()->ActivatePane(kAlnPane);
    Settle();
    for (int id : {ID_FILE_PRINT, ID_FILE_PRINT_PREVIEW, ID_FILE_EXPORT_PDF}) {
        EXPECT_FALSE(Enabled(id)) << id;  // an empty project
    }
    ASSERT_TRUE(app->Document().AddFiles({kGlobins}));
    Settle();
    for (int id : {ID_FILE_PRINT, ID_FILE_PRINT_PREVIEW, ID_FILE_EXPORT_PDF}) {
        EXPECT_TRUE(Enabled(id)) << id;
    }
    // The text pane prints nothing yet.
    app->MainFrame()->ActivatePane(kTextPane);
    Settle();
    EXPECT_FALSE(Enabled(ID_FILE_PRINT));
}

TEST_F(PrintCommandTest, MarginsLargerThanThePageAreToldAndChangeNothing) {
    Start({kGlobins});
    CPageSetup setup;
    setup.marginL = setup.marginR = 20000;  // 20 inches on each side
    app->Settings().SavePageSetup(setup);
    app->MainFrame()->ActivatePane(kAlnPane);
    Settle();
    const std::vector<std::uint8_t> before = app->Document().Project()->ToBytes();
    const bool modified = app->Document().IsModified();
    for (int id : {ID_FILE_PRINT, ID_FILE_PRINT_PREVIEW}) {
        messages.clear();
        ASSERT_TRUE(app->Router().Run(id));
        Settle();
        EXPECT_EQ(messages, QStringList{QString::fromLatin1(PrintMessages::kNoRoom)}) << id;
    }
    EXPECT_EQ(app->Document().Project()->ToBytes(), before);
    EXPECT_EQ(app->Document().IsModified(), modified);
}

TEST_F(PrintCommandTest, PreviewShowsThePlannedPages) {
    Start({kGlobins});
    app->MainFrame()->ActivatePane(kAlnPane);
    Settle();
    // What the preview's printer will be asked to print, counted beforehand.
    const CPageSetup page = app->Settings().LoadPageSetup();
    const CRowsPrinter pages(
        *app->MainFrame()->Pane(kAlnPane)->PrintableRows(),
        PrintSetupFromStored(page.marginL, page.marginR, page.marginT, page.marginB,
                             page.isMetric != 0, page.header, page.footer),
        {});
    QString error;
    const int expected = pages.PageCount(app->Printer(), error);
    ASSERT_GT(expected, 0) << error.toStdString();

    int shown = -1;
    QTimer::singleShot(0, [&shown] {
        for (QWidget* widget : QApplication::topLevelWidgets()) {
            if (auto* dialog = qobject_cast<QPrintPreviewDialog*>(widget)) {
                shown = dialog->findChild<QPrintPreviewWidget*>()->pageCount();
                dialog->reject();
            }
        }
    });
    ASSERT_TRUE(app->Router().Run(ID_FILE_PRINT_PREVIEW));
    EXPECT_EQ(shown, expected);
    EXPECT_TRUE(messages.isEmpty()) << messages.join('|').toStdString();
}
