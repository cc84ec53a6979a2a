#pragma once
// A modal dialog that runs one job on a worker thread of lower priority and shows its phases:
// a status text, a progress bar and a looping animation. Cancel only asks the job to stop; the
// dialog ends when the job has returned, with Accepted for a complete run and Rejected
// otherwise, so the caller never sees a half-finished result.

#include <QDialog>
#include <QLabel>
#include <QMutex>
#include <QProgressBar>
#include <QPushButton>
#include <QThread>
#include <QTimer>
#include <atomic>
#include <functional>

class QSvgRenderer;

// The looping animation beside the status text.
class CProgressAnimation : public QWidget {
    Q_OBJECT
  public:
    explicit CProgressAnimation(QWidget* parent = nullptr);
    QSize sizeHint() const override { return {48, 48}; }
    bool IsRunning() const { return m_running; }
    void Stop();

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    QSvgRenderer* m_renderer;
    bool m_running = true;
};

class CProgressDlg : public QDialog {
    Q_OBJECT
  public:
    // Runs on the worker thread; returns 1 for a complete run, 0 otherwise.
    using Job = std::function<int(CProgressDlg&)>;
    // The progress bar's own range: larger phases are scaled into it.
    static constexpr int kBarRange = 1 << 30;

    CProgressDlg(const QString& title, Job job, bool showCancel, bool showProgress,
                 QWidget* parent = nullptr);
    ~CProgressDlg() override;

    // Called from the worker thread.
    void BeginPhase(const QString& text, qint64 lower, qint64 upper, qint64 step);
    // Advances by one step; returns true, without advancing, once cancel was requested.
    bool StepProgress();
    void SetStatusText(const QString& text);
    bool IsCancelRequested() const { return m_cancelRequested.load(); }

    // Called from the user-interface thread: the Cancel button, Escape and closing the window.
    void RequestCancel();
    void reject() override;

    QString StatusText() const;
    QProgressBar* ProgressBar() const { return m_bar; }
    QPushButton* CancelButton() const { return m_cancel; }
    CProgressAnimation* Animation() const { return m_animation; }
    bool IsRunning() const { return m_thread && m_thread->isRunning(); }

    // The bar value for `position` within [lower, upper], scaled into 0..kBarRange when the
    // phase is longer than that.
    static int BarValue(qint64 position, qint64 lower, qint64 upper);
    static int BarMaximum(qint64 lower, qint64 upper);

  signals:
    // Emitted on the worker thread after each step.
    void stepped(qint64 position);

  protected:
    void showEvent(QShowEvent* event) override;
    void closeEvent(QCloseEvent* event) override;

  private:
    void StartJob();
    void Refresh();
    void OnJobFinished();

    Job m_job;
    QLabel* m_text;
    QProgressBar* m_bar;
    QPushButton* m_cancel;
    CProgressAnimation* m_animation;
    QTimer m_refreshTimer;
    QThread* m_thread = nullptr;

    mutable QMutex m_textLock;
    QString m_statusText;
    std::atomic<qint64> m_lower{0};
    std::atomic<qint64> m_upper{0};
    std::atomic<qint64> m_step{1};
    std::atomic<qint64> m_position{0};
    std::atomic<bool> m_cancelRequested{false};
    std::atomic<int> m_result{0};
};
