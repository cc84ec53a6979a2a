#pragma once
// "Page Setup": paper size, margins, header and footer of printed panes. Lengths are kept in
// thousandths of an inch, or hundredths of a millimetre where the user's locale is metric.

#include <QComboBox>
#include <QDialog>
#include <QDoubleSpinBox>
#include <QLineEdit>

#include "Settings.h"

class CPageSetupDlg : public QDialog {
    Q_OBJECT
  public:
    CPageSetupDlg(const CPageSetup& setup, QWidget* parent = nullptr);
    // The set-up as edited, in the units of the user's locale.
    CPageSetup Result() const;

    static bool LocaleIsMetric();
    // Stored units per millimetre or inch shown in the dialog.
    static double UnitsPerShown(bool metric) { return metric ? 100.0 : 1000.0; }
    // Converts stored lengths from one unit system to the other.
    static int Convert(int value, bool fromMetric, bool toMetric);
    // What the codes of the header and footer fields stand for, shown beside them.
    static QString HeaderCodesLegend();

    QComboBox* PaperSize() const { return m_paper; }
    QDoubleSpinBox* Margin(int index) const { return m_margins[index]; }
    QLineEdit* Header() const { return m_header; }
    QLineEdit* Footer() const { return m_footer; }

  private:
    CPageSetup m_setup;
    bool m_metric;
    QComboBox* m_paper;
    QDoubleSpinBox* m_margins[4];  // left, right, top, bottom
    QLineEdit* m_header;
    QLineEdit* m_footer;
};
