#pragma once
// `tiler-blocks --export VIEW=FILE [--export VIEW=FILE ...] [--width N] [--columns FIRST-LAST]
// PROJECT.bpr`: figures of a saved project's panes, drawn without a window. Exit statuses: 0
// done, 1 nothing to draw, 2 bad usage or unreadable input (the worst of all figures).

#include <QList>
#include <QString>
#include <QStringList>
#include <QTextStream>

#include "print/FigureExport.h"

struct CFigureRequest {
    QString view;  // a name of FigureViewNames()
    QString path;
};

struct CFigureCommand {
    QList<CFigureRequest> figures;
    CFigureOptions options;
    QString project;
};

// Whether the program's arguments (without the program name) ask for figures.
bool AsksForFigures(const QStringList& arguments);
// Reads the arguments; false with `error` on bad usage (unknown view, unknown extension, a
// missing or extra project, a malformed number or column range).
bool ParseFigureCommand(const QStringList& arguments, CFigureCommand& command, QString& error);
// Parses, reads the project and writes every figure; messages go to `err`.
int RunFigureCommand(const QStringList& arguments, QTextStream& err);
// The option lines of the program's --help.
QString FigureUsage();
