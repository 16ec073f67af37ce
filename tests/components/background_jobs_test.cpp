#include "components/worker/background_jobs.h"

#include <QCoreApplication>
#include <QTest>
#include <QThread>

#include <gtest/gtest.h>

#include <stdexcept>

TEST(BackgroundJobs, AnErrorComesBackOnTheOwnersThreadAndACancelledJobSaysNothing) {
    BackgroundJobs jobs;
    QObject receiver;
    QString error;
    bool cancelledSpoke = false;
    JobCallbacks<int> failing;
    failing.failed = [&, owner = QThread::currentThread()](const QString& text) {
        if (QThread::currentThread() == owner) error = text;
    };
    jobs.run<int>(
        &receiver, [](JobControl&) -> int { throw std::runtime_error("disk gone"); }, failing);
    const JobCallbacks<int> endless{
        [&](int) { cancelledSpoke = true; }, [&](const QString&) { cancelledSpoke = true; }, {}};
    Job job = jobs.run<int>(
        &receiver,
        [](JobControl& control) {
            while (!control.isCanceled()) QThread::msleep(1);
            return 7;
        },
        endless);

    ASSERT_TRUE(QTest::qWaitFor([&] { return !error.isEmpty(); }));
    EXPECT_EQ(error, "disk gone");
    job.cancel();
    job.waitForFinished();
    QCoreApplication::sendPostedEvents();
    EXPECT_FALSE(cancelledSpoke);
}
