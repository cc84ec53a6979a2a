#include "print/PrintCommands.h"

#include <QAbstractPrintDialog>
#include <QBuffer>
#include <QFileDialog>
#include <QFileInfo>
#include <QPdfWriter>
#include <QPrintDialog>
#include <QPrintPreviewDialog>
#include <QPrinter>

#include "CommandIds.h"
#include "SafeSave.h"

namespace {

QString PrintWithDialog(QWidget* parent, QPrinter& printer, const CRowsPrinter& rows) {
    QString error;
    const int pages = rows.PageCount(printer, error);
    if (pages == 0) {
        return error;
    }
    QPrintDialog dialog(&printer, parent);
    dialog.setMinMax(1, pages);
    dialog.setOption(QAbstractPrintDialog::PrintPageRange);
    if (dialog.exec() != QDialog::Accepted) {
        return {};
    }
    rows.Print(printer, error);
    return error;
}

QString Preview(QWidget* parent, QPrinter& printer, const CRowsPrinter& rows) {
    QString error;
    if (rows.PageCount(printer, error) == 0) {
        return error;
    }
    // The preview prints every page, whatever range the last print asked for.
    printer.setPrintRange(QPrinter::AllPages);
    QPrintPreviewDialog dialog(&printer, parent);
    QObject::connect(&dialog, &QPrintPreviewDialog::paintRequested, &dialog,
                     [&rows, &error](QPrinter* target) { rows.Print(*target, error); });
    dialog.exec();
    return error;
}

QString ExportPdf(QWidget* parent, QPrinter& printer, const CRowsPrinter& rows,
                  const QString& projectPath) {
    const QFileInfo project(projectPath);
    const QString suggested =
        projectPath.isEmpty() ? QStringLiteral("alignment.pdf")
                              : project.dir().filePath(project.completeBaseName() + ".pdf");
    const QString path =
        QFileDialog::getSaveFileName(parent, QStringLiteral("Export to PDF"), suggested,
                                     QStringLiteral("PDF files (*.pdf)"));
    if (path.isEmpty()) {
        return {};
    }
    QString error;
    WritePdf(path, printer.pageLayout(), rows, error);
    return error;
}

}  // namespace

bool CanPrint(const IPrintableRows* rows) {
    return rows && rows->ColumnCount() > 0 && rows->PrintRowCount() > 0;
}

bool WritePdf(const QString& path, const QPageLayout& layout, const CRowsPrinter& printer,
              QString& error) {
    // Printed in memory first, then saved as every file of the program is.
    QBuffer file;
    file.open(QIODevice::WriteOnly);
    {
        QPdfWriter writer(&file);
        writer.setCreator(QStringLiteral("Tiler Blocks"));
        writer.setTitle(QFileInfo(path).completeBaseName());
        writer.setPageLayout(layout);
        if (!printer.Print(writer, error)) {
            return false;
        }
    }
    QString reason;
    if (!SaveFileContents(path, file.data(), &reason)) {
        error = QString::fromLatin1(PrintMessages::kFileNotWritten).arg(path);
        if (!reason.isEmpty())
            error += QLatin1Char('\n') + reason;
        return false;
    }
    return true;
}

QString RunPrintCommand(int id, QWidget* parent, QPrinter& printer, const IPrintableRows& rows,
                        const CPrintSetup& setup, const QString& projectPath) {
    const CRowsPrinter pages(rows, setup, {QDateTime::currentDateTime(), projectPath});
    switch (id) {
        case ID_FILE_PRINT:
            return PrintWithDialog(parent, printer, pages);
        case ID_FILE_PRINT_PREVIEW:
            return Preview(parent, printer, pages);
        case ID_FILE_EXPORT_PDF:
            return ExportPdf(parent, printer, pages, projectPath);
        default:
            return {};
    }
}
