#pragma once
// The search engine bound to a progress dialog: phases, steps and texts go to the dialog, the
// dialog's Cancel button stops the run after the current item.

#include "SimTool.h"

class CProgressDlg;

class CDeskTopSimTool : public CSimTool {
  public:
    CDeskTopSimTool(const CScoreMatrix& matrix, const CSimBlockParameters& parameters,
                    const std::vector<CSxMolEntry>& molecules, CSimBlockSet* result,
                    CProgressDlg& dialog);

  protected:
    void BeginPhase(const std::string& text, int lower, int upper, int step) override;
    bool StepProgress() override;
    int Finish(int ok) override;
    void ReportProgress(const char* format, ...) override __attribute__((format(printf, 2, 3)));
    void SetStatusText(const std::string& text) override;
    bool IsCancelled() override;
    void ShowMessage(const std::string& message) override;

  private:
    CProgressDlg& m_dialog;
};
