#pragma once
// What print and figure tests read back from written files.

#include <QByteArray>
#include <QFile>
#include <QRegularExpression>
#include <QString>

// The number of page objects of a PDF file ("/Type /Page", not "/Type /Pages"); -1 when the
// file is missing or is no PDF.
inline int PdfPageCount(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        return -1;
    }
    const QByteArray bytes = file.readAll();
    if (!bytes.startsWith("%PDF-")) {
        return -1;
    }
    static const QRegularExpression page(QStringLiteral("/Type\\s*/Page(?![a-zA-Z])"));
    return static_cast<int>(QString::fromLatin1(bytes).count(page));
}
