#include "HelpWindow.h"

#include <QAction>
#include <QDesktopServices>
#include <QDir>
#include <QLabel>
#include <QLineEdit>
#include <QPointer>
#include <QShortcut>
#include <QTextBrowser>
#include <QToolBar>

namespace {

const char kIndexPage[] = "index.html";

QAction* AddAction(QToolBar* bar, const QString& text, QKeySequence::StandardKey key) {
    QAction* action = bar->addAction(text);
    action->setShortcut(key);
    action->setToolTip(text + QStringLiteral(" (") +
                       QKeySequence(key).toString(QKeySequence::NativeText) + QStringLiteral(")"));
    return action;
}

}  // namespace

CHelpWindow::CHelpWindow(const QString& manualDir)
    : m_manualDir(manualDir), m_browser(new QTextBrowser(this)), m_findField(new QLineEdit) {
    setObjectName(QStringLiteral("helpWindow"));
    setAttribute(Qt::WA_DeleteOnClose, false);
    m_browser->setSearchPaths({manualDir});
    // Pages of the manual open here; addresses outside it go to the desktop's browser.
    m_browser->setOpenExternalLinks(true);
    setCentralWidget(m_browser);

    QToolBar* bar = addToolBar(QStringLiteral("Help"));
    bar->setMovable(false);
    QAction* back = AddAction(bar, QStringLiteral("Back"), QKeySequence::Back);
    QAction* forward = AddAction(bar, QStringLiteral("Forward"), QKeySequence::Forward);
    QAction* home = bar->addAction(QStringLiteral("Contents"));
    back->setEnabled(false);
    forward->setEnabled(false);
    connect(back, &QAction::triggered, m_browser, &QTextBrowser::backward);
    connect(forward, &QAction::triggered, m_browser, &QTextBrowser::forward);
    connect(home, &QAction::triggered, this, [this] { ShowPage(kIndexPage); });
    connect(m_browser, &QTextBrowser::backwardAvailable, back, &QAction::setEnabled);
    connect(m_browser, &QTextBrowser::forwardAvailable, forward, &QAction::setEnabled);

    bar->addSeparator();
    bar->addWidget(new QLabel(QStringLiteral(" Find: ")));
    m_findField->setObjectName(QStringLiteral("findField"));
    m_findField->setClearButtonEnabled(true);
    m_findField->setMaximumWidth(240);
    bar->addWidget(m_findField);
    QAction* previous = AddAction(bar, QStringLiteral("Previous"), QKeySequence::FindPrevious);
    QAction* next = AddAction(bar, QStringLiteral("Next"), QKeySequence::FindNext);
    connect(m_findField, &QLineEdit::returnPressed, this,
            [this] { FindText(m_findField->text()); });
    connect(m_findField, &QLineEdit::textChanged, this, [this] { ShowFindResult(true); });
    connect(next, &QAction::triggered, this, [this] { FindText(m_findField->text()); });
    connect(previous, &QAction::triggered, this, [this] { FindText(m_findField->text(), true); });
    auto* findKey = new QShortcut(QKeySequence::Find, this);
    connect(findKey, &QShortcut::activated, this, [this] {
        m_findField->setFocus();
        m_findField->selectAll();
    });

    bar->addSeparator();
    QAction* external = bar->addAction(QStringLiteral("Open in Web Browser"));
    connect(external, &QAction::triggered, this,
            [this] { QDesktopServices::openUrl(m_browser->source()); });

    connect(m_browser, &QTextBrowser::sourceChanged, this, [this] {
        const QString title = m_browser->documentTitle();
        setWindowTitle(title.isEmpty() ? QStringLiteral("Tiler Blocks Help")
                                       : title + QStringLiteral(" - Tiler Blocks Help"));
    });
    resize(820, 680);
}

CHelpWindow* CHelpWindow::Instance(const QString& manualDir) {
    static QPointer<CHelpWindow> window;
    if (!window)
        window = new CHelpWindow(manualDir);
    return window;
}

void CHelpWindow::ShowPage(const QString& fileName) {
    m_browser->setSource(QUrl::fromLocalFile(QDir(m_manualDir).filePath(fileName)));
    show();
    raise();
    activateWindow();
}

bool CHelpWindow::FindText(const QString& text, bool backwards) {
    if (text.isEmpty())
        return false;
    const QTextDocument::FindFlags flags =
        backwards ? QTextDocument::FindBackward : QTextDocument::FindFlags();
    bool found = m_browser->find(text, flags);
    if (!found) {
        // Go round once: from the other end of the page.
        QTextCursor cursor = m_browser->textCursor();
        cursor.movePosition(backwards ? QTextCursor::End : QTextCursor::Start);
        m_browser->setTextCursor(cursor);
        found = m_browser->find(text, flags);
    }
    ShowFindResult(found);
    return found;
}

void CHelpWindow::ShowFindResult(bool found) {
    m_findField->setStyleSheet(found ? QString()
                                     : QStringLiteral("QLineEdit { background: #ffd8d8; }"));
    m_findField->setToolTip(found ? QString() : QStringLiteral("Not found on this page"));
}
