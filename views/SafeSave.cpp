#include "SafeSave.h"

#include <QFile>

#include "archive/FileIO.h"

bool SaveFileContents(const QString& path, const std::string& bytes, QString* reason) {
    const std::string localPath = QFile::encodeName(path).toStdString();
    try {
        WriteFileAtomically(localPath, bytes);
        return true;
    } catch (const CFileException& e) {
        if (reason)
            *reason = QString::fromLocal8Bit(e.Reason());
        return false;
    }
}

bool SaveFileContents(const QString& path, const QByteArray& bytes, QString* reason) {
    return SaveFileContents(path, bytes.toStdString(), reason);
}
