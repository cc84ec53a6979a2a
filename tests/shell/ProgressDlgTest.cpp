#include <gtest/gtest.h>

#include <QTest>
#include <QTimer>
#include <atomic>

#include "ProgressDlg.h"
#include "QtPrinters.h"

namespace {

TEST(ProgressDlg, EndsWithOkAfterACompleteRunOnALowerPriorityThread) {
    std::atomic<int> priority{-1};
    std::atomic<bool> onOtherThread{false};
    QThread* uiThread = QThread::currentThread();
    CProgressDlg dialog(
        QStringLiteral("Block search progress"),
        [&](CProgressDlg& progress) {
            priority = QThread::currentThread()->priority();
            onOtherThread = QThread::currentThread() != uiThread;
            progress.BeginPhase(QStringLiteral("Performing pairwise comparisons..."), 0, 3, 1);
            for (int i = 0; i < 3; ++i) {
                EXPECT_FALSE(progress.StepProgress());
            }
            progress.SetStatusText(QStringLiteral("done"));
            return 1;
        },
        true, true);
    EXPECT_EQ(dialog.windowTitle(), QStringLiteral("Block search progress"));
    EXPECT_EQ(dialog.exec(), QDialog::Accepted);
    EXPECT_TRUE(onOtherThread);
    EXPECT_EQ(priority, QThread::LowPriority);
    EXPECT_EQ(dialog.StatusText(), QStringLiteral("done"));
    EXPECT_EQ(dialog.ProgressBar()->maximum(), 3);
    EXPECT_EQ(dialog.ProgressBar()->value(), 3);
    EXPECT_FALSE(dialog.Animation()->IsRunning());
}

TEST(ProgressDlg, EndsWithCancelWhenTheJobFails) {
    CProgressDlg dialog(
        QString(), [](CProgressDlg&) { return 0; }, true, true);
    EXPECT_EQ(dialog.windowTitle(), QStringLiteral("Processing..."));
    EXPECT_EQ(dialog.exec(), QDialog::Rejected);
}

TEST(ProgressDlg, CancelStopsTheJobAfterItsCurrentStep) {
    std::atomic<int> stepsAfterCancel{0};
    CProgressDlg dialog(
        QStringLiteral("Block search progress"),
        [&](CProgressDlg& progress) {
            progress.BeginPhase(QStringLiteral("Expanding diagonals..."), 0, 1000000000, 1);
            while (!progress.StepProgress()) {
            }
            // Once cancelled, steps keep reporting the cancel.
            stepsAfterCancel += progress.StepProgress() ? 1 : 0;
            return 0;
        },
        true, true);
    QTimer::singleShot(0, &dialog, [&] {
        // Escape and the window's close button only ask to cancel: the dialog stays open.
        dialog.reject();
        EXPECT_TRUE(dialog.isVisible());
    });
    EXPECT_EQ(dialog.exec(), QDialog::Rejected);
    EXPECT_TRUE(dialog.IsCancelRequested());
    EXPECT_EQ(stepsAfterCancel, 1);
}

TEST(ProgressDlg, CancelButtonOnlyRequestsCancel) {
    std::atomic<bool> sawCancel{false};
    CProgressDlg dialog(
        QString(),
        [&](CProgressDlg& progress) {
            while (!progress.IsCancelRequested()) {
                QThread::yieldCurrentThread();
            }
            sawCancel = true;
            return 1;  // a job may still finish its work after a cancel request
        },
        true, false);
    QTimer::singleShot(0, &dialog, [&] {
        EXPECT_TRUE(dialog.CancelButton()->isVisible());
        EXPECT_FALSE(dialog.ProgressBar()->isVisible());
        QTest::mouseClick(dialog.CancelButton(), Qt::LeftButton);
    });
    EXPECT_EQ(dialog.exec(), QDialog::Accepted);
    EXPECT_TRUE(sawCancel);
}

TEST(ProgressDlg, ScalesLongPhasesIntoTheBar) {
    EXPECT_EQ(CProgressDlg::BarMaximum(0, 2016), 2016);
    EXPECT_EQ(CProgressDlg::BarValue(1000, 0, 2016), 1000);
    EXPECT_EQ(CProgressDlg::BarValue(5, 10, 20), 0);    // below the range
    EXPECT_EQ(CProgressDlg::BarValue(99, 10, 20), 10);  // above it
    EXPECT_EQ(CProgressDlg::BarMaximum(5, 5), 0);
    // Beyond what a 16-bit or 32-bit bar holds, proportions stay right.
    const qint64 huge = 5'000'000'000LL;
    EXPECT_EQ(CProgressDlg::BarMaximum(0, huge), CProgressDlg::kBarRange);
    EXPECT_NEAR(CProgressDlg::BarValue(huge / 2, 0, huge), CProgressDlg::kBarRange / 2, 1);
    EXPECT_EQ(CProgressDlg::BarValue(huge, 0, huge), CProgressDlg::kBarRange);
    const qint64 large = 100'000;  // more than 16 bits
    EXPECT_EQ(CProgressDlg::BarValue(70'000, 0, large), 70'000);
}

}  // namespace
