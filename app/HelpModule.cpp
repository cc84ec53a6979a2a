// The help module: loaded by name when the user asks for help, it shows the manual that comes
// with the program in the program's own help window.
#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>

#include "HelpWindow.h"

namespace {

// The manual's folder: named by TB_MANUAL_DIR, installed beside the program, or in the sources.
QString ManualDir() {
    const QString fromEnvironment = qEnvironmentVariable("TB_MANUAL_DIR");
    const QString programDir = QCoreApplication::applicationDirPath();
    for (const QString& dir :
         {fromEnvironment, programDir + QStringLiteral("/../share/tiler-blocks/manual"),
          QStringLiteral(TB_SOURCE_MANUAL_DIR)}) {
        if (!dir.isEmpty() && QFileInfo::exists(dir + QStringLiteral("/index.html"))) {
            return QDir(dir).absolutePath();
        }
    }
    return {};
}

int OpenPage(const QString& page) {
    const QString dir = ManualDir();
    const QString name = QFileInfo(page).fileName();  // pages of the manual folder only
    if (dir.isEmpty() || name.isEmpty() || !QFileInfo::exists(dir + QLatin1Char('/') + name)) {
        return 0;
    }
    CHelpWindow::Instance(dir)->ShowPage(name);
    return 1;
}

}  // namespace

extern "C" Q_DECL_EXPORT int OpenHelpFile(const char* /*helpKey*/, const char* /*title*/) {
    return OpenPage(QStringLiteral("index.html"));
}

extern "C" Q_DECL_EXPORT int OpenHelpPage(const char* page) {
    return OpenPage(QString::fromUtf8(page ? page : ""));
}
