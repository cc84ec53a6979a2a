#include "FileTypes.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcess>
#include <QStandardPaths>

#include "SafeSave.h"

namespace {

const char kDefaultsGroup[] = "[Default Applications]";

bool WriteText(const QString& path, const QString& text) {
    QDir().mkpath(QFileInfo(path).absolutePath());
    return SaveFileContents(path, text.toUtf8());
}

QString ReadText(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

void RunIfPresent(const QString& tool, const QString& folder) {
    const QString executable = QStandardPaths::findExecutable(tool);
    if (!executable.isEmpty()) {
        QProcess::startDetached(executable, {folder});
    }
}

}  // namespace

// The installed desktop entry names the program by its name; the one written for the user
// names this very program file.
QString CFileTypes::DesktopEntry(const QString& programPath) {
    QStringList lines = ReadText(QStringLiteral(":/tiler-blocks.desktop")).split(QLatin1Char('\n'));
    for (QString& line : lines) {
        if (line.startsWith(QLatin1String("Exec="))) {
            line = QStringLiteral("Exec=\"%1\" %f").arg(programPath);
        }
    }
    return lines.join(QLatin1Char('\n'));
}

QString CFileTypes::MimeTypesXml() {
    return ReadText(QStringLiteral(":/tiler-blocks-mime.xml"));
}

QString CFileTypes::WithDefaults(const QString& mimeApps, const QStringList& types,
                                 const QString& desktopFile) {
    QStringList lines = mimeApps.split(QLatin1Char('\n'));
    if (!lines.isEmpty() && lines.last().isEmpty()) {
        lines.removeLast();
    }
    int group = lines.indexOf(QLatin1String(kDefaultsGroup));
    if (group < 0) {
        if (!lines.isEmpty()) {
            lines << QString();
        }
        lines << QLatin1String(kDefaultsGroup);
        group = lines.size() - 1;
    }
    int end = group + 1;
    while (end < lines.size() && !lines[end].startsWith(QLatin1Char('['))) {
        ++end;
    }
    int insertAt = end;
    while (insertAt > group + 1 && lines[insertAt - 1].trimmed().isEmpty()) {
        --insertAt;
    }
    for (const QString& type : types) {
        bool present = false;
        for (int i = group + 1; i < end; ++i) {
            present = present || lines[i].section(QLatin1Char('='), 0, 0).trimmed() == type;
        }
        if (!present) {
            lines.insert(insertAt++, type + QLatin1Char('=') + desktopFile);
            ++end;
        }
    }
    return lines.join(QLatin1Char('\n')) + QLatin1Char('\n');
}

bool CFileTypes::Register(const QString& programPath) {
    const QString data = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    const QString config = QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation);
    bool ok = WriteText(data + QStringLiteral("/applications/") + kDesktopFileName,
                        DesktopEntry(programPath));
    ok = WriteText(data + QStringLiteral("/mime/packages/tiler-blocks.xml"), MimeTypesXml()) && ok;
    ok = WriteText(data + QStringLiteral("/icons/hicolor/scalable/apps/tiler-blocks.svg"),
                   ReadText(QStringLiteral(":/icons/tiler-blocks.svg"))) &&
         ok;
    const QString mimeAppsPath = config + QStringLiteral("/mimeapps.list");
    const QString mimeApps = ReadText(mimeAppsPath);
    const QString updated =
        WithDefaults(mimeApps, {QLatin1String(kProjectType), QLatin1String(kTemplateType)},
                     QLatin1String(kDesktopFileName));
    if (updated != mimeApps) {
        ok = WriteText(mimeAppsPath, updated) && ok;
    }
    RunIfPresent(QStringLiteral("update-mime-database"), data + QStringLiteral("/mime"));
    RunIfPresent(QStringLiteral("update-desktop-database"), data + QStringLiteral("/applications"));
    return ok;
}
