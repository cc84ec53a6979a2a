// tiler-blocks: the graphical program.
#include <QApplication>

#include "QuilterApp.h"
#include "ShellResources.h"

int main(int argc, char** argv) {
    QApplication application(argc, argv);
    QApplication::setApplicationName(QStringLiteral("Tiler Blocks"));
    InitShellResources();
    QStringList arguments = QApplication::arguments();
    arguments.removeFirst();
    CQuilterApp app;
    if (!app.InitInstance(arguments)) {
        return 1;
    }
    const int status = QApplication::exec();
    app.ExitInstance();
    return status;
}
