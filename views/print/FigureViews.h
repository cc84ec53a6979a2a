#pragma once
// The panes that draw figures without a window, by the name `--export NAME=FILE` gives them.

#include <QStringList>
#include <memory>

class CPaneView;

// A new pane of that name, not yet given a document; null for an unknown name.
std::unique_ptr<CPaneView> MakeFigurePane(const QString& name);
// The names, for messages and --help.
QStringList FigureViewNames();
