#pragma once
// The manual in a window of the program's own: pages with their links, Back, Forward, Home and
// Find, so that help works on machines without a web browser. One window serves every request.

#include <QMainWindow>
#include <QUrl>

class QLineEdit;
class QTextBrowser;

class CHelpWindow : public QMainWindow {
    Q_OBJECT
  public:
    // The manual's folder (holding index.html).
    explicit CHelpWindow(const QString& manualDir);

    // The window of this run, made on first use.
    static CHelpWindow* Instance(const QString& manualDir);

    // Shows a page of the manual folder and brings the window forward.
    void ShowPage(const QString& fileName);
    QTextBrowser* Browser() const { return m_browser; }
    // Selects the next (or previous) place of `text` on the page, going round once; false
    // when the page does not hold it.
    bool FindText(const QString& text, bool backwards = false);

  private:
    void ShowFindResult(bool found);

    QString m_manualDir;
    QTextBrowser* m_browser;
    QLineEdit* m_findField;
};
