#include "print/FigureCommand.h"

#include <QFileInfo>
#include <algorithm>
#include <exception>
#include <memory>

#include "BlockProject.h"
#include "PaneView.h"
#include "archive/Archive.h"
#include "archive/FileIO.h"
#include "print/FigureViews.h"
#include "print/ProjectHolder.h"

namespace {

bool ParsePositive(const QString& text, int& value) {
    bool ok = false;
    value = text.toInt(&ok);
    return ok && value > 0;
}

// "FIRST-LAST", 1-based and inclusive, into [first, end) 0-based.
bool ParseColumns(const QString& text, CFigureOptions& options) {
    const QStringList parts = text.split(u'-');
    int first = 0;
    int last = 0;
    if (parts.size() != 2 || !ParsePositive(parts[0], first) || !ParsePositive(parts[1], last) ||
        last < first) {
        return false;
    }
    options.firstColumn = first - 1;
    options.endColumn = last;
    return true;
}

// The value of an option given as "--name value" or "--name=value".
bool TakeValue(const QStringList& arguments, qsizetype& index, const QString& name,
               QString& value) {
    const QString& argument = arguments[index];
    if (argument == name && index + 1 < arguments.size()) {
        value = arguments[++index];
        return true;
    }
    if (argument.startsWith(name + u'=')) {
        value = argument.mid(name.size() + 1);
        return true;
    }
    return false;
}

bool ParseRequest(const QString& text, CFigureRequest& request, QString& error) {
    const qsizetype equals = text.indexOf(u'=');
    request.view = text.left(equals);
    request.path = equals < 0 ? QString() : text.mid(equals + 1);
    if (equals <= 0 || request.path.isEmpty()) {
        error = QStringLiteral("--export needs VIEW=FILE, not \"%1\".").arg(text);
        return false;
    }
    if (!FigureViewNames().contains(request.view)) {
        error = QStringLiteral("Unknown view \"%1\": the views are %2.")
                    .arg(request.view, FigureViewNames().join(QStringLiteral(", ")));
        return false;
    }
    return FigureFormatOf(request.path, &error).has_value();
}

// The project file, or null with `error`.
std::unique_ptr<CBlockProject> ReadProject(const QString& path, QString& error) {
    const std::string name = path.toStdString();
    if (!QFileInfo(path).isFile()) {
        error = QStringLiteral("Cannot read \"%1\".").arg(path);
        return nullptr;
    }
    std::unique_ptr<CBlockProject> project;
    try {
        project = CBlockProject::Load(name);
    } catch (const CArchiveException& exception) {
        error = QString::fromStdString(exception.Report(FileNameOf(name)));
        return nullptr;
    } catch (const std::exception&) {
        error = QStringLiteral("Cannot read \"%1\".").arg(path);
        return nullptr;
    }
    if (!project) {
        error = QStringLiteral("\"%1\" is not a block project.").arg(path);
    }
    return project;
}

}  // namespace

bool AsksForFigures(const QStringList& arguments) {
    return std::any_of(arguments.begin(), arguments.end(), [](const QString& argument) {
        return argument == u"--export" || argument.startsWith(u"--export=");
    });
}

bool ParseFigureCommand(const QStringList& arguments, CFigureCommand& command, QString& error) {
    command = {};
    for (qsizetype i = 0; i < arguments.size(); ++i) {
        QString value;
        if (TakeValue(arguments, i, QStringLiteral("--export"), value)) {
            CFigureRequest request;
            if (!ParseRequest(value, request, error)) {
                return false;
            }
            command.figures << request;
        } else if (TakeValue(arguments, i, QStringLiteral("--width"), value)) {
            if (!ParsePositive(value, command.options.width)) {
                error = QStringLiteral("--width needs a number of pixels, not \"%1\".").arg(value);
                return false;
            }
        } else if (TakeValue(arguments, i, QStringLiteral("--columns"), value)) {
            if (!ParseColumns(value, command.options)) {
                error = QStringLiteral(
                            "--columns needs FIRST-LAST (1-based, FIRST <= LAST), "
                            "not \"%1\".")
                            .arg(value);
                return false;
            }
        } else if (arguments[i].startsWith(u'-')) {
            error = QStringLiteral("Unknown option \"%1\".").arg(arguments[i]);
            return false;
        } else if (command.project.isEmpty()) {
            command.project = arguments[i];
        } else {
            error =
                QStringLiteral("One project at a time: \"%1\" is one too many.").arg(arguments[i]);
            return false;
        }
    }
    if (command.figures.isEmpty() || command.project.isEmpty()) {
        error = QStringLiteral("--export needs VIEW=FILE and a project file.");
        return false;
    }
    return true;
}

int RunFigureCommand(const QStringList& arguments, QTextStream& err) {
    CFigureCommand command;
    QString error;
    if (!ParseFigureCommand(arguments, command, error)) {
        err << "tiler-blocks: " << error << "\n";
        return kFigureFailed;
    }
    std::unique_ptr<CBlockProject> project = ReadProject(command.project, error);
    if (!project) {
        err << "tiler-blocks: " << error << "\n";
        return kFigureFailed;
    }
    CProjectHolder document(std::move(project));
    int status = kFigureDone;
    for (const CFigureRequest& request : command.figures) {
        std::unique_ptr<CPaneView> pane = MakeFigurePane(request.view);
        pane->SetDocument(&document);
        pane->OnUpdate(nullptr, kHintAll);
        const IPrintableRows* rows = pane->PrintableRows();
        int result = kFigureNothingToDraw;
        if (rows) {
            result = WriteFigure(*rows, request.path, command.options, error);
        } else {
            error = QStringLiteral("The %1 pane draws nothing.").arg(request.view);
        }
        if (result != kFigureDone) {
            err << "tiler-blocks: " << request.path << ": " << error << "\n";
        }
        status = std::max(status, result);
    }
    return status;
}

QString FigureUsage() {
    return QStringLiteral(
               "  --export VIEW=FILE    draw a pane of PROJECT.bpr into FILE without a window and "
               "exit;\n"
               "                        VIEW is %1; FILE ends in .svg, .png or .pdf;\n"
               "                        may be given several times\n"
               "  --width N             the figures' width in pixels (default: the pane's own)\n"
               "  --columns FIRST-LAST  only these display columns (1-based)\n"
               "  Exit status of --export: 0 done, 1 nothing to draw, 2 bad usage or unreadable "
               "input.\n")
        .arg(FigureViewNames().join(QStringLiteral(", ")));
}
