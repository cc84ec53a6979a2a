// `tiler-blocks --export`: figures of a saved project's alignment pane in SVG, PNG and PDF,
// read back from the files, and every failure status.
#include <gtest/gtest.h>

#include <QDir>
#include <QFile>
#include <QImage>
#include <QTemporaryDir>
#include <QTextStream>
#include <QTransform>
#include <QXmlStreamReader>
#include <map>

#include "PaneView.h"
#include "PrintTestHelpers.h"
#include "QtPrinters.h"
#include "print/FigureCommand.h"
#include "print/FigureViews.h"
#include "print/ProjectHolder.h"
#include "project/ProjectFixtures.h"

namespace {

// alpha: ATWWGH at 5, PQRST at 17; beta: ATWWGH at 0, PQRST at 6; gamma takes part in no link.
const char* const kFasta =
    ">alpha\nMKVLAATWWGHDEKLMNPQRST\n"
    ">beta\nATWWGHPQRSTVV\n"
    ">gamma\nGGMKVLAATWWGHDE\n";
// Linking ATWWGH puts beta's at column 5; linking PQRST then puts beta's at column 17.
const std::map<QString, QString> kShownRows = {
    {QStringLiteral("alpha"), QStringLiteral("mkvlaATWWGHdeklmnPQRST")},
    {QStringLiteral("beta"), QStringLiteral("-----ATWWGH------PQRSTvv")},
    {QStringLiteral("gamma"), QStringLiteral("ggmkvlaatwwghde")},
};

// One text element of an SVG file with its position on the picture.
struct CSvgText {
    QPointF at;
    QString text;
};

QTransform ParseMatrix(const QString& attribute) {
    const QString inner = attribute.section(u'(', 1).section(u')', 0, 0);
    const QStringList values = inner.split(u',');
    if (!attribute.startsWith(u"matrix") || values.size() != 6) {
        return {};
    }
    return QTransform(values[0].toDouble(), values[1].toDouble(), values[2].toDouble(),
                      values[3].toDouble(), values[4].toDouble(), values[5].toDouble());
}

// Every text element with its x and y mapped through the transforms of the groups around it.
std::vector<CSvgText> ReadSvgTexts(const QString& path, QString& error) {
    QFile file(path);
    std::vector<CSvgText> texts;
    if (!file.open(QIODevice::ReadOnly)) {
        error = QStringLiteral("cannot open");
        return texts;
    }
    QXmlStreamReader xml(&file);
    std::vector<QTransform> transforms{QTransform()};
    while (!xml.atEnd()) {
        xml.readNext();
        if (xml.isStartElement()) {
            const auto attributes = xml.attributes();
            QTransform own = ParseMatrix(attributes.value(QLatin1String("transform")).toString());
            transforms.push_back(own * transforms.back());
            if (xml.name() == u"text") {
                const QPointF at(attributes.value(QLatin1String("x")).toDouble(),
                                 attributes.value(QLatin1String("y")).toDouble());
                const QPointF mapped = transforms.back().map(at);
                texts.push_back({mapped, xml.readElementText()});
                transforms.pop_back();
            }
        } else if (xml.isEndElement()) {
            transforms.pop_back();
        }
    }
    if (xml.hasError()) {
        error = xml.errorString();
    }
    return texts;
}

class FigureExportTest : public ::testing::Test {
  protected:
    void SetUp() override {
        CBlockProject project = ProjectWith(scratch, kFasta);
        InstallBlocks(project, {{{0, 1}, {5, 0}, 6, 45}, {{0, 1}, {17, 6}, 5, 30}});
        CRecordingPrompt prompt;
        ASSERT_TRUE(
            project.Link(std::vector<ALN_BSEL_ENTRY>{{"alpha", 5, 11}, {"beta", 0, 6}}, prompt));
        ASSERT_TRUE(
            project.Link(std::vector<ALN_BSEL_ENTRY>{{"alpha", 17, 22}, {"beta", 11, 16}}, prompt));
        projectPath = Path("linked.bpr");
        project.Save(projectPath.toStdString());
    }

    QString Path(const QString& name) const { return QDir(dir.path()).filePath(name); }

    int Export(QStringList arguments) {
        errors.clear();
        QTextStream stream(&errors);
        return RunFigureCommand(arguments, stream);
    }

    CScratchDir scratch{"tb_figures"};
    QTemporaryDir dir;
    QString projectPath;
    QString errors;
};

// The rows of the pane as it draws them for figures.
struct CShownPane {
    CProjectHolder document;
    std::unique_ptr<CPaneView> pane = MakeFigurePane(QStringLiteral("alignment"));

    explicit CShownPane(const QString& path) : document(CBlockProject::Load(path.toStdString())) {
        pane->SetDocument(&document);
        pane->OnUpdate(nullptr, kHintAll);
    }
    const IPrintableRows& Rows() const { return *pane->PrintableRows(); }
};

}  // namespace

TEST_F(FigureExportTest, SvgKeepsEveryResidueAsTextAtItsRowAndColumn) {
    const QString svg = Path("figure.svg");
    ASSERT_EQ(Export({"--export", "alignment=" + svg, projectPath}), kFigureDone)
        << errors.toStdString();
    QString error;
    const std::vector<CSvgText> texts = ReadSvgTexts(svg, error);
    ASSERT_TRUE(error.isEmpty()) << error.toStdString();

    const CShownPane shown(projectPath);
    CRowPrintOptions options;
    options.textPerCharacter = true;
    const int left = shown.Rows().LeftWidth(options);
    const double column = shown.Rows().ColumnWidth(options);
    // Row tops from the row heights; the ruler is row 0.
    std::vector<int> tops{0};
    for (int row = 0; row < shown.Rows().PrintRowCount(); ++row) {
        tops.push_back(tops.back() + shown.Rows().PrintRowHeight(row, options));
    }
    ASSERT_EQ(tops.size(), 5u);
    auto rowAt = [&tops](double y) {
        return int(std::upper_bound(tops.begin(), tops.end(), y) - tops.begin()) - 1;
    };

    std::map<int, QString> names;
    std::map<int, std::map<int, QString>> cells;
    for (const CSvgText& text : texts) {
        const int row = rowAt(text.at.y() - 1);  // the baseline lies inside its row
        if (row < 1) {
            continue;  // the ruler's numbers
        }
        if (text.at.x() < left) {
            if (!text.text.startsWith(u'(')) {  // not the position number
                names[row] += text.text;
            }
            continue;
        }
        const int at = int((text.at.x() - left) / column);
        EXPECT_EQ(text.text.size(), 1) << text.text.toStdString();
        EXPECT_FALSE(cells[row].contains(at)) << "two texts in row " << row << " column " << at;
        cells[row][at] = text.text;
    }
    ASSERT_EQ(names.size(), 3u);
    for (const auto& [row, name] : names) {
        QString shownText;
        int next = 0;
        for (const auto& [at, character] : cells[row]) {
            EXPECT_EQ(at, next++) << name.toStdString();
            shownText += character;
        }
        ASSERT_TRUE(kShownRows.contains(name.trimmed())) << name.toStdString();
        EXPECT_EQ(shownText, kShownRows.at(name.trimmed()));
    }
}

TEST_F(FigureExportTest, PngHasTheAskedWidthAndPdfOpensWithOnePage) {
    const QString png = Path("figure.png");
    const QString pdf = Path("figure.pdf");
    ASSERT_EQ(Export({"--export", "alignment=" + png, "--export", "alignment=" + pdf, "--width",
                      "777", projectPath}),
              kFigureDone)
        << errors.toStdString();
    const QImage image(png);
    ASSERT_FALSE(image.isNull());
    EXPECT_EQ(image.width(), 777);
    // The height keeps the pane's proportions.
    const CShownPane shown(projectPath);
    const QSize natural = shown.Rows().ContentSize(0, shown.Rows().ColumnCount(), 0,
                                                   shown.Rows().PrintRowCount(), {});
    EXPECT_NEAR(image.height(), 777.0 * natural.height() / natural.width(), 1.0);
    EXPECT_EQ(PdfPageCount(pdf), 1);

    // Without --width the image is the pane's own size; a column range narrows it.
    ASSERT_EQ(Export({"--export", "alignment=" + png, projectPath}), kFigureDone);
    EXPECT_EQ(QImage(png).size(), natural);
    ASSERT_EQ(Export({"--columns", "3-12", "--export=alignment=" + png, projectPath}), kFigureDone);
    EXPECT_EQ(QImage(png).width(),
              shown.Rows().ContentSize(2, 12, 0, shown.Rows().PrintRowCount(), {}).width());
}

TEST_F(FigureExportTest, BadUsageAndUnreadableInputGiveStatusTwo) {
    const QString svg = Path("out.svg");
    QFile text(Path("notes.txt"));
    ASSERT_TRUE(text.open(QIODevice::WriteOnly));
    text.write(">alpha\nMKV\n");
    text.close();
    const std::vector<QStringList> cases = {
        {"--export", "alignment=" + svg, Path("missing.bpr")},              // no such file
        {"--export", "alignment=" + svg, Path("notes.txt")},                // not a project
        {"--export", "histogram=" + svg, projectPath},                      // unknown view
        {"--export", "alignment=" + Path("out.gif"), projectPath},          // unknown extension
        {"--export", "alignment", projectPath},                             // no file
        {"--export", "alignment=" + svg},                                   // no project
        {"--export", "alignment=" + svg, "--width", "-4", projectPath},     // bad width
        {"--export", "alignment=" + svg, "--columns", "9-3", projectPath},  // reversed range
        {"--export", "alignment=" + svg, "--columns", "x", projectPath},    // malformed range
        {"--export", "alignment=" + svg, "--frobnicate", projectPath},      // unknown option
        {"--export", "alignment=" + svg, projectPath, projectPath},         // two projects
        {"--export", "alignment=" + Path("no/such/folder/out.svg"), projectPath},  // unwritable
    };
    for (const QStringList& arguments : cases) {
        EXPECT_EQ(Export(arguments), kFigureFailed) << arguments.join(' ').toStdString();
        EXPECT_FALSE(errors.isEmpty()) << arguments.join(' ').toStdString();
    }
    EXPECT_FALSE(QFile::exists(svg));
    EXPECT_TRUE(QDir(dir.path()).entryList({"*.svg"}, QDir::Files).isEmpty());
}

TEST_F(FigureExportTest, NothingToDrawGivesStatusOneAndLeavesOldFiles) {
    const QString png = Path("out.png");
    QFile old(png);
    ASSERT_TRUE(old.open(QIODevice::WriteOnly));
    old.write("earlier figure");
    old.close();

    const QString empty = Path("empty.bpr");
    CBlockProject().Save(empty.toStdString());
    EXPECT_EQ(Export({"--export", "alignment=" + png, empty}), kFigureNothingToDraw);
    // Columns beyond the alignment's 24.
    EXPECT_EQ(Export({"--export", "alignment=" + png, "--columns", "25-30", projectPath}),
              kFigureNothingToDraw);
    ASSERT_TRUE(old.open(QIODevice::ReadOnly));
    EXPECT_EQ(old.readAll(), QByteArray("earlier figure"));
    old.close();

    // Several figures: each is written when it can be, and the worst status is the answer.
    const QString svg = Path("good.svg");
    EXPECT_EQ(Export({"--export", "alignment=" + svg, "--export",
                      "alignment=" + Path("no/such/folder/out.png"), projectPath}),
              kFigureFailed);
    EXPECT_TRUE(QFile::exists(svg));
    EXPECT_EQ(Export({"--export", "alignment=" + svg, "--export", "alignment=" + png, "--columns",
                      "20-30", projectPath}),
              kFigureDone);
    EXPECT_NE(QImage(png).width(), 0);
}

TEST(FigureCommandLine, ReadsRepeatedExportsAndOptions) {
    CFigureCommand command;
    QString error;
    ASSERT_TRUE(ParseFigureCommand({"--export", "alignment=a.svg", "p.bpr", "--width=640",
                                    "--export=alignment=b.PDF", "--columns", "10-20"},
                                   command, error))
        << error.toStdString();
    ASSERT_EQ(command.figures.size(), 2);
    EXPECT_EQ(command.figures[1].path, QStringLiteral("b.PDF"));
    EXPECT_EQ(command.project, QStringLiteral("p.bpr"));
    EXPECT_EQ(command.options.width, 640);
    EXPECT_EQ(command.options.firstColumn, 9);
    EXPECT_EQ(command.options.endColumn, 20);
    EXPECT_TRUE(AsksForFigures({"p.bpr", "--export=alignment=x.png"}));
    EXPECT_FALSE(AsksForFigures({"p.bpr", "--exported"}));
    // A file name may hold "=".
    ASSERT_TRUE(ParseFigureCommand({"--export", "alignment=a=b.png", "p.bpr"}, command, error));
    EXPECT_EQ(command.figures[0].path, QStringLiteral("a=b.png"));
    EXPECT_EQ(FigureFormatOf(QStringLiteral("x.Svg")), FigureFormat::svg);
    EXPECT_FALSE(FigureFormatOf(QStringLiteral("svg")));
}
