#include "DeskTopSimTool.h"

#include <QMetaObject>

#include "ProgressDlg.h"
#include "TcxMsgBox.h"

CDeskTopSimTool::CDeskTopSimTool(const CScoreMatrix& matrix, const CSimBlockParameters& parameters,
                                 const std::vector<CSxMolEntry>& molecules, CSimBlockSet* result,
                                 CProgressDlg& dialog)
    : CSimTool(matrix, parameters, molecules, result), m_dialog(dialog) {}

void CDeskTopSimTool::BeginPhase(const std::string& text, int lower, int upper, int step) {
    m_dialog.BeginPhase(QString::fromStdString(text), lower, upper, step);
}

bool CDeskTopSimTool::StepProgress() {
    return m_dialog.StepProgress();
}

// The dialog ends when the worker thread has returned, not here.
int CDeskTopSimTool::Finish(int ok) {
    return ok;
}

void CDeskTopSimTool::ReportProgress(const char* format, ...) {
    va_list args;
    va_start(args, format);
    const std::string text = FormatText(format, args);
    va_end(args);
    SetStatusText(text);
}

void CDeskTopSimTool::SetStatusText(const std::string& text) {
    m_dialog.SetStatusText(QString::fromStdString(text));
}

bool CDeskTopSimTool::IsCancelled() {
    return m_dialog.IsCancelRequested() || CSimTool::IsCancelled();
}

void CDeskTopSimTool::ShowMessage(const std::string& message) {
    // Message boxes belong to the user-interface thread; the worker waits for the answer.
    const QString text = QString::fromStdString(message);
    QMetaObject::invokeMethod(
        &m_dialog, [this, text] { CTcxMsgBox::Show(&m_dialog, text, MB_OK | MB_ICONEXCLAMATION); },
        Qt::BlockingQueuedConnection);
}
