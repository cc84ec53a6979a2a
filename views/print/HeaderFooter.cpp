#include "print/HeaderFooter.h"

#include <QFileInfo>
#include <QLocale>
#include <optional>

namespace {

// The text of a value code; nothing when `code` is none.
std::optional<QString> ValueOf(QChar code, const CPageTextContext& context) {
    const QLocale locale;
    switch (code.unicode()) {
        case 'D':
            return locale.toString(context.now.date(), QLocale::ShortFormat);
        case 'T':
            return locale.toString(context.now.time(), QLocale::LongFormat);
        case 'p':
            return QString::number(context.page);
        case 'P':
            return QString::number(context.pageCount);
        case 'f':
            return context.filePath;
        case 's':
            return QFileInfo(context.filePath).fileName();
        case '&':
            return QStringLiteral("&");
        default:
            return std::nullopt;
    }
}

// Where a placement code puts the pending text, or null.
QString* PartOf(QChar code, CPageTextParts& parts) {
    switch (code.unicode()) {
        case 'l':
            return &parts.left;
        case 'c':
            return &parts.centre;
        case 'r':
            return &parts.right;
        default:
            return nullptr;
    }
}

}  // namespace

CPageTextParts ExpandHeaderFooter(const QString& codes, const CPageTextContext& context) {
    CPageTextParts parts;
    QString pending;
    for (qsizetype i = 0; i < codes.size(); ++i) {
        if (codes[i] != u'&' || i + 1 == codes.size()) {
            pending += codes[i];
            continue;
        }
        const QChar code = codes[++i];
        if (QString* part = PartOf(code, parts)) {
            *part += pending;
            pending.clear();
        } else if (const std::optional<QString> value = ValueOf(code, context)) {
            pending += *value;
        } else {
            pending += u'&';
            pending += code;
        }
    }
    parts.left += pending;
    return parts;
}
