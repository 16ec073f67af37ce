#include "components/worker/background_jobs.h"

#include <QThread>

BackgroundJobs::BackgroundJobs(int threads, QObject* parent) : QObject(parent) {
    pool_.setMaxThreadCount(threads);
    // Below the user-interface thread, so a long decode never makes the window lag.
    pool_.setThreadPriority(QThread::LowPriority);
}

BackgroundJobs::~BackgroundJobs() {
    for (QFuture<void>& future : running_) future.cancel();
    pool_.waitForDone();
}

void BackgroundJobs::Track(QFuture<void> future) {
    running_.removeIf([](const QFuture<void>& job) { return job.isFinished(); });
    running_.append(std::move(future));
}
