#include "HelpModule.h"

#include <QCoreApplication>
#include <QLibrary>

namespace {

const char kModuleName[] = "HelpModule";

using OpenHelpFileFunction = int (*)(const char*, const char*);
using OpenHelpPageFunction = int (*)(const char*);

// Beside the program, in its library folder when installed, or where the build put it.
QStringList Candidates() {
    const QString programDir = QCoreApplication::applicationDirPath();
    QStringList candidates = {
        programDir + QLatin1Char('/') + QLatin1String(kModuleName),
        programDir + QStringLiteral("/../lib/tiler-blocks/") + QLatin1String(kModuleName)};
#ifdef TB_HELP_MODULE_DIR
    candidates << QStringLiteral(TB_HELP_MODULE_DIR "/") + QLatin1String(kModuleName);
#endif
    candidates << QLatin1String(kModuleName);
    return candidates;
}

QLibrary* Module() {
    static QLibrary* loaded = nullptr;
    if (!loaded) {
        for (const QString& candidate : Candidates()) {
            auto library = std::make_unique<QLibrary>(candidate);
            if (library->load()) {
                loaded = library.release();  // kept for the rest of the run
                break;
            }
        }
    }
    return loaded;
}

}  // namespace

bool CHelpModule::OpenHelpFile(const char* helpKey, const char* title) {
    QLibrary* module = Module();
    if (!module) {
        return false;
    }
    if (auto open = reinterpret_cast<OpenHelpFileFunction>(module->resolve("OpenHelpFile"))) {
        open(helpKey, title);
    }
    return true;
}

bool CHelpModule::OpenHelpPage(const QString& page) {
    QLibrary* module = Module();
    auto open =
        module ? reinterpret_cast<OpenHelpPageFunction>(module->resolve("OpenHelpPage")) : nullptr;
    return open && open(page.toUtf8().constData()) != 0;
}

QString CHelpModule::LoadedPath() {
    QLibrary* module = Module();
    return module ? module->fileName() : QString();
}
