#pragma once
// Page header and footer texts from the page setup's codes:
//   &D date, &T time, &p page number, &P page count, &f the project's path, &s its file name,
//   && a literal "&";
//   &l, &c, &r place the text written since the previous placement code (or the start) at the
//   left, in the centre or at the right. Text after the last placement code goes to the left.
// So the default header "&D&c" is the date centred and the default footer "&s Page &p&l" the
// file name and page number at the left. An unknown code is kept as written.

#include <QDateTime>
#include <QString>

// What the codes of one page expand to.
struct CPageTextContext {
    QDateTime now;
    QString filePath;  // empty for an unsaved project
    int page = 1;      // 1-based
    int pageCount = 1;
};

// The three parts of a header or footer line.
struct CPageTextParts {
    QString left;
    QString centre;
    QString right;

    bool IsEmpty() const { return left.isEmpty() && centre.isEmpty() && right.isEmpty(); }
    bool operator==(const CPageTextParts&) const = default;
};

CPageTextParts ExpandHeaderFooter(const QString& codes, const CPageTextContext& context);
