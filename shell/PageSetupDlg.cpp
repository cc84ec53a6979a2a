#include "PageSetupDlg.h"

#include <QLabel>

#include <QDialogButtonBox>
#include <QFormLayout>
#include <QLocale>
#include <QPageSize>
#include <cmath>

namespace {
const QPageSize::PageSizeId kPaperSizes[] = {QPageSize::A4, QPageSize::Letter, QPageSize::Legal,
                                             QPageSize::A3, QPageSize::A5};
}

bool CPageSetupDlg::LocaleIsMetric() {
    return QLocale().measurementSystem() == QLocale::MetricSystem;
}

int CPageSetupDlg::Convert(int value, bool fromMetric, bool toMetric) {
    if (fromMetric == toMetric) {
        return value;
    }
    // 1 inch = 25.4 mm: 1000 thousandths of an inch = 2540 hundredths of a millimetre.
    return static_cast<int>(std::lround(toMetric ? value * 2.54 : value / 2.54));
}

QString CPageSetupDlg::HeaderCodesLegend() {
    return QStringLiteral(
        "<small>Codes: <b>&amp;D</b> date, <b>&amp;T</b> time, <b>&amp;p</b> page number, "
        "<b>&amp;P</b> page count, <b>&amp;s</b> file name, <b>&amp;f</b> file with its folder, "
        "<b>&amp;&amp;</b> an &amp;. <b>&amp;l</b>, <b>&amp;c</b> and <b>&amp;r</b> place the "
        "text before them at the left, centre or right.</small>");
}

CPageSetupDlg::CPageSetupDlg(const CPageSetup& setup, QWidget* parent)
    : QDialog(parent),
      m_setup(setup),
      m_metric(LocaleIsMetric()),
      m_paper(new QComboBox(this)),
      m_header(new QLineEdit(setup.header, this)),
      m_footer(new QLineEdit(setup.footer, this)) {
    setWindowTitle(QStringLiteral("Page Setup"));
    const QPageSize::Unit unit = m_metric ? QPageSize::Millimeter : QPageSize::Inch;
    const double perShown = UnitsPerShown(m_metric);
    const bool storedMetric = setup.isMetric != 0;

    m_paper->addItem(QStringLiteral("Printer default"));
    const int storedX = Convert(setup.pageSizeX, storedMetric, m_metric);
    const int storedY = Convert(setup.pageSizeY, storedMetric, m_metric);
    for (QPageSize::PageSizeId id : kPaperSizes) {
        const QPageSize size(id);
        m_paper->addItem(size.name(), static_cast<int>(id));
        const QSizeF shown = size.size(unit);
        if (std::abs(std::lround(shown.width() * perShown) - storedX) <= 2 &&
            std::abs(std::lround(shown.height() * perShown) - storedY) <= 2) {
            m_paper->setCurrentIndex(m_paper->count() - 1);
        }
    }

    auto* form = new QFormLayout(this);
    form->addRow(QStringLiteral("&Paper:"), m_paper);
    const int values[4] = {setup.marginL, setup.marginR, setup.marginT, setup.marginB};
    const char* const labels[4] = {
        "&Left margin:", "&Right margin:", "&Top margin:", "&Bottom margin:"};
    for (int i = 0; i < 4; ++i) {
        m_margins[i] = new QDoubleSpinBox(this);
        m_margins[i]->setDecimals(2);
        m_margins[i]->setRange(0, m_metric ? 100 : 4);
        m_margins[i]->setSuffix(m_metric ? QStringLiteral(" mm") : QStringLiteral(" in"));
        m_margins[i]->setValue(Convert(values[i], storedMetric, m_metric) / perShown);
        form->addRow(QString::fromLatin1(labels[i]), m_margins[i]);
    }
    form->addRow(QStringLiteral("&Header:"), m_header);
    form->addRow(QStringLiteral("&Footer:"), m_footer);
    auto* legend = new QLabel(HeaderCodesLegend(), this);
    legend->setObjectName(QStringLiteral("headerCodes"));
    legend->setWordWrap(true);
    legend->setTextFormat(Qt::RichText);
    form->addRow(QString(), legend);
    m_header->setToolTip(HeaderCodesLegend());
    m_footer->setToolTip(HeaderCodesLegend());
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    form->addRow(buttons);
}

CPageSetup CPageSetupDlg::Result() const {
    CPageSetup result = m_setup;
    const double perShown = UnitsPerShown(m_metric);
    result.isMetric = m_metric ? 1 : 0;
    result.pageSizeX = result.pageSizeY = 0;
    if (m_paper->currentIndex() > 0) {
        const QPageSize size(static_cast<QPageSize::PageSizeId>(m_paper->currentData().toInt()));
        const QSizeF shown = size.size(m_metric ? QPageSize::Millimeter : QPageSize::Inch);
        result.pageSizeX = static_cast<int>(std::lround(shown.width() * perShown));
        result.pageSizeY = static_cast<int>(std::lround(shown.height() * perShown));
    }
    int* margins[4] = {&result.marginL, &result.marginR, &result.marginT, &result.marginB};
    for (int i = 0; i < 4; ++i) {
        *margins[i] = static_cast<int>(std::lround(m_margins[i]->value() * perShown));
    }
    result.header = m_header->text();
    result.footer = m_footer->text();
    return result;
}
