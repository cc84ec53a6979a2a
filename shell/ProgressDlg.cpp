#include "ProgressDlg.h"

#include <QCloseEvent>
#include <QGridLayout>
#include <QHBoxLayout>
#include <QPainter>
#include <QSvgRenderer>

namespace {
constexpr int kRefreshMilliseconds = 50;
}

CProgressAnimation::CProgressAnimation(QWidget* parent)
    : QWidget(parent), m_renderer(new QSvgRenderer(QStringLiteral(":/progress/search.svg"), this)) {
    setFixedSize(sizeHint());
    connect(m_renderer, &QSvgRenderer::repaintNeeded, this, [this] {
        if (m_running) {
            update();
        }
    });
}

void CProgressAnimation::Stop() {
    m_running = false;
}

void CProgressAnimation::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    m_renderer->render(&painter, rect());
}

CProgressDlg::CProgressDlg(const QString& title, Job job, bool showCancel, bool showProgress,
                           QWidget* parent)
    : QDialog(parent),
      m_job(std::move(job)),
      m_text(new QLabel(this)),
      m_bar(new QProgressBar(this)),
      m_cancel(new QPushButton(QStringLiteral("Cancel"), this)),
      m_animation(new CProgressAnimation(this)) {
    setWindowTitle(title.isEmpty() ? QStringLiteral("Processing...") : title);
    setModal(true);
    m_text->setWordWrap(true);
    m_text->setMinimumWidth(360);
    m_text->setMinimumHeight(m_text->fontMetrics().height() * 2);
    m_bar->setTextVisible(false);
    m_bar->setRange(0, 0);
    m_bar->setVisible(showProgress);
    m_cancel->setVisible(showCancel);

    auto* grid = new QGridLayout(this);
    grid->addWidget(m_animation, 0, 0, 2, 1, Qt::AlignTop);
    grid->addWidget(m_text, 0, 1, 1, 2);
    grid->addWidget(m_bar, 1, 1);
    grid->addWidget(m_cancel, 1, 2);
    grid->setColumnStretch(1, 1);
    setSizeGripEnabled(true);

    connect(m_cancel, &QPushButton::clicked, this, &CProgressDlg::RequestCancel);
    m_refreshTimer.setInterval(kRefreshMilliseconds);
    connect(&m_refreshTimer, &QTimer::timeout, this, &CProgressDlg::Refresh);
}

CProgressDlg::~CProgressDlg() {
    if (m_thread) {
        m_cancelRequested = true;
        m_thread->wait();
    }
}

void CProgressDlg::showEvent(QShowEvent* event) {
    QDialog::showEvent(event);
    if (!m_thread) {
        StartJob();
    }
}

void CProgressDlg::StartJob() {
    m_thread = QThread::create([this] { m_result = m_job ? m_job(*this) : 0; });
    m_thread->setParent(this);
    connect(m_thread, &QThread::finished, this, &CProgressDlg::OnJobFinished, Qt::QueuedConnection);
    m_refreshTimer.start();
    m_thread->start(QThread::LowPriority);
}

void CProgressDlg::OnJobFinished() {
    m_refreshTimer.stop();
    m_animation->Stop();
    Refresh();
    // The job has returned: from here on the caller may read what it produced.
    done(m_result.load() != 0 ? QDialog::Accepted : QDialog::Rejected);
}

void CProgressDlg::BeginPhase(const QString& text, qint64 lower, qint64 upper, qint64 step) {
    m_lower = lower;
    m_upper = upper;
    m_step = step > 0 ? step : 1;
    m_position = lower;
    SetStatusText(text);
}

bool CProgressDlg::StepProgress() {
    if (m_cancelRequested.load()) {
        return true;
    }
    const qint64 position = m_position.fetch_add(m_step.load()) + m_step.load();
    emit stepped(position);
    return m_cancelRequested.load();
}

void CProgressDlg::SetStatusText(const QString& text) {
    QMutexLocker lock(&m_textLock);
    m_statusText = text;
}

QString CProgressDlg::StatusText() const {
    QMutexLocker lock(&m_textLock);
    return m_statusText;
}

void CProgressDlg::RequestCancel() {
    m_cancelRequested = true;
}

void CProgressDlg::reject() {
    // Escape while the job runs is a cancel request; the job's end closes the dialog.
    if (IsRunning()) {
        RequestCancel();
        return;
    }
    QDialog::reject();
}

void CProgressDlg::closeEvent(QCloseEvent* event) {
    if (IsRunning()) {
        RequestCancel();
        event->ignore();
        return;
    }
    QDialog::closeEvent(event);
}

int CProgressDlg::BarMaximum(qint64 lower, qint64 upper) {
    const qint64 range = upper - lower;
    return range <= 0 ? 0 : static_cast<int>(std::min<qint64>(range, kBarRange));
}

int CProgressDlg::BarValue(qint64 position, qint64 lower, qint64 upper) {
    const qint64 range = upper - lower;
    if (range <= 0) {
        return 0;
    }
    const qint64 done = std::clamp<qint64>(position - lower, 0, range);
    if (range <= kBarRange) {
        return static_cast<int>(done);
    }
    return static_cast<int>(static_cast<long double>(done) * kBarRange / range);
}

void CProgressDlg::Refresh() {
    m_text->setText(StatusText());
    const qint64 lower = m_lower.load();
    const qint64 upper = m_upper.load();
    const int maximum = BarMaximum(lower, upper);
    m_bar->setRange(0, std::max(maximum, 1));
    m_bar->setValue(maximum == 0 ? 0 : BarValue(m_position.load(), lower, upper));
}
