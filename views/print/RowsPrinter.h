#pragma once
// Prints the rows of a pane (IPrintableRows) page by page onto a printer, a PDF writer or the
// print preview: page setup margins, header and footer bands, stretches of columns. The same
// routine serves File > Print, Print Preview and Export to PDF.

#include <QString>

#include "print/HeaderFooter.h"
#include "print/PrintLayout.h"
#include "rows/PrintableRows.h"

class QPagedPaintDevice;
class QPainter;
class QPrinter;

class CRowsPrinter {
  public:
    // `context` supplies the date, time and file name of the headers; page fields are set here.
    CRowsPrinter(const IPrintableRows& rows, const CPrintSetup& setup, CPageTextContext context);

    // The rows in millimetres, as printed.
    CRowsMetrics Metrics() const;
    // The plan for a page of `page` millimetres; false with `error` when nothing can be printed.
    bool Plan(QSizeF page, CPrintPlan& plan, CPageBands& bands, QString& error) const;

    // Prepares the device (full page, the setup's paper) and prints every page, or the
    // printer's page range; false with `error` when nothing was printed.
    bool Print(QPagedPaintDevice& device, QString& error) const;
    // Prepares the device as Print does and answers its page count; 0 with `error` when
    // nothing can be printed.
    int PageCount(QPagedPaintDevice& device, QString& error) const;

  private:
    void PreparePage(QPagedPaintDevice& device) const;
    void PaintPage(QPainter& painter, const CPrintPlan& plan, const CPageBands& bands,
                   int page) const;
    void PaintPiece(QPainter& painter, const CRectMm& body, const CPrintPiece& piece) const;
    void PaintBand(QPainter& painter, const CRectMm& band, const QString& codes, int page,
                   int pageCount, bool lineBelow) const;
    static CRowPrintOptions Options();

    const IPrintableRows& m_rows;
    CPrintSetup m_setup;
    CPageTextContext m_context;
};

// The user messages of printing.
namespace PrintMessages {
inline constexpr char kNoRoom[] =
    "The page margins leave no room to print on. Make them smaller in Page Setup.";
inline constexpr char kNothingToPrint[] = "There is nothing to print in this pane.";
inline constexpr char kPrinterNotOpened[] = "The printer could not be opened.";
inline constexpr char kFileNotWritten[] = "The file \"%1\" could not be written.";
}  // namespace PrintMessages
