#pragma once
// The program's commands: one row per command id with its menu text, keys, status-bar text,
// tooltip and icon. Menus, toolbars and accelerators are all built from this table.

#include <QKeySequence>
#include <QList>
#include <QString>

struct CCommandInfo {
    int id;
    const char* menuText;
    const char* keys;    // key sequences separated by ";", or empty
    const char* prompt;  // "status text\ntooltip"
    const char* icon;    // file name below :/icons, or empty
    bool checkable;

    QString MenuText() const { return QString::fromLatin1(menuText); }
    QList<QKeySequence> Keys() const;
    QString StatusText() const;
    QString ToolTip() const;
    QString IconPath() const;
};

const QList<CCommandInfo>& CommandTable();
// The row of `id`, or nullptr.
const CCommandInfo* FindCommand(int id);

// The idle text of the status bar.
inline constexpr char kIdleStatusText[] = "Ready";
