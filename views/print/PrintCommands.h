#pragma once
// File > Print, Print Preview and Export to PDF for the active pane. The frame passes the
// pane's rows, the application's printer and the page setup; what the user must be told comes
// back as text for the program's message box.

#include <QPageLayout>
#include <QString>

#include "print/RowsPrinter.h"

class QPrinter;
class QWidget;

// Runs ID_FILE_PRINT, ID_FILE_PRINT_PREVIEW or ID_FILE_EXPORT_PDF. Returns the message to show,
// empty when all went well or the user cancelled.
QString RunPrintCommand(int id, QWidget* parent, QPrinter& printer, const IPrintableRows& rows,
                        const CPrintSetup& setup, const QString& projectPath);

// Whether a pane with these rows has anything to print.
bool CanPrint(const IPrintableRows* rows);

// Writes the pages to a PDF file through a temporary file that replaces `path` only when
// complete; false with `error` otherwise.
bool WritePdf(const QString& path, const QPageLayout& layout, const CRowsPrinter& printer,
              QString& error);
