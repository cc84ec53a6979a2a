// tiler-blocks: the graphical program, or figures of a saved project drawn without a window.
#include <QApplication>
#include <QTextStream>

#include "QuilterApp.h"
#include "ShellResources.h"
#include "print/FigureCommand.h"

namespace {

QStringList ArgumentsOf(int argc, char** argv) {
    QStringList arguments;
    for (int i = 1; i < argc; ++i) {
        arguments << QString::fromLocal8Bit(argv[i]);
    }
    return arguments;
}

void PrintUsage() {
    QTextStream out(stdout);
    out << "Usage: tiler-blocks [PROJECT.bpr | SEQUENCE-FILE...]\n"
           "       tiler-blocks --export VIEW=FILE [--export VIEW=FILE ...] [--width N]\n"
           "                    [--columns FIRST-LAST] PROJECT.bpr\n"
           "\n"
           "Finds conserved blocks in protein sequences. Opens a block project, or starts a new\n"
           "project with the molecules of the sequence files.\n"
           "\n"
           "Options:\n"
           "  --help                show this text and exit\n"
           "  --version             show the program's version and exit\n"
        << FigureUsage();
}

}  // namespace

int main(int argc, char** argv) {
    const QStringList arguments = ArgumentsOf(argc, argv);
    if (arguments.contains(QStringLiteral("--help")) || arguments.contains(QStringLiteral("-h"))) {
        PrintUsage();
        return 0;
    }
    if (arguments.contains(QStringLiteral("--version"))) {
        QTextStream(stdout) << "tiler-blocks " TB_VERSION "\n";
        return 0;
    }
    if (AsksForFigures(arguments)) {
        // Figures need no display.
        qputenv("QT_QPA_PLATFORM", "offscreen");
        QApplication application(argc, argv);
        QStringList figureArguments = QApplication::arguments();
        figureArguments.removeFirst();
        QTextStream err(stderr);
        return RunFigureCommand(figureArguments, err);
    }
    QApplication application(argc, argv);
    QApplication::setApplicationName(QStringLiteral("Tiler Blocks"));
    InitShellResources();
    QStringList programArguments = QApplication::arguments();
    programArguments.removeFirst();
    CQuilterApp app;
    if (!app.InitInstance(programArguments)) {
        return 1;
    }
    const int status = QApplication::exec();
    app.ExitInstance();
    return status;
}
