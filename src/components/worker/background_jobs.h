#pragma once

#include <QFutureWatcher>
#include <QList>
#include <QObject>
#include <QPromise>
#include <QString>
#include <QThreadPool>

#include <exception>
#include <functional>
#include <memory>
#include <optional>
#include <utility>

// What a job's work sees on its worker thread: where to report how far it has come and whether
// it is still wanted.
class JobControl {
  public:
    virtual ~JobControl() = default;
    virtual void reportProgress(int percent) = 0;  // 0..100
    virtual bool isCanceled() const = 0;
};

// One job as its owner holds it on the user-interface thread. Copies share the job; a
// default-made Job is none.
class Job {
  public:
    Job() = default;
    explicit Job(QFuture<void> future) : future_(std::move(future)) {}

    // Asks the work to stop at its next check; nothing of it is delivered any more.
    void cancel() { future_.cancel(); }
    // Blocks until the work has returned: for shutting down and for tests, never for the window.
    void waitForFinished() { future_.waitForFinished(); }

  private:
    QFuture<void> future_;
};

// What a job delivers to its owner: a progress callback (0..100) while it runs, then either its
// result or, when the work threw, the error's text.
template <typename T>
struct JobCallbacks {
    std::function<void(T)> done;
    std::function<void(const QString& error)> failed;
    std::function<void(int percent)> progress;
};

// Runs long jobs (decoding, re-saving, converting) on a few worker threads of its own, so the
// user-interface thread never waits for them. Each job is a QPromise on a QThreadPool; its
// result, error and progress come back through a QFutureWatcher, on the thread that called run,
// by its event loop. A cancelled job delivers nothing, and neither does a job whose receiver is
// gone. The work must not touch objects of the user-interface
// thread: it takes copies and hands back its result.
class BackgroundJobs : public QObject {
    Q_OBJECT
  public:
    explicit BackgroundJobs(int threads = 2, QObject* parent = nullptr);
    // Cancels every job and waits for the ones already running to return.
    ~BackgroundJobs() override;

    template <typename T>
    Job run(QObject* receiver, std::function<T(JobControl&)> work, JobCallbacks<T> callbacks);

  private:
    template <typename T>
    struct Outcome {
        std::optional<T> value;
        QString error;
    };
    template <typename T>
    class PromiseControl;

    void Track(QFuture<void> future);

    QThreadPool pool_;
    QList<QFuture<void>> running_;
};

template <typename T>
class BackgroundJobs::PromiseControl : public JobControl {
  public:
    explicit PromiseControl(QPromise<Outcome<T>>& promise) : promise_(promise) {}
    void reportProgress(int percent) override { promise_.setProgressValue(percent); }
    bool isCanceled() const override { return promise_.isCanceled(); }

  private:
    QPromise<Outcome<T>>& promise_;
};

template <typename T>
Job BackgroundJobs::run(QObject* receiver, std::function<T(JobControl&)> work,
                        JobCallbacks<T> callbacks) {
    using Result = Outcome<T>;
    // The watcher lives as long as the receiver at most, so nothing reaches a receiver that is
    // gone.
    auto* watcher = new QFutureWatcher<Result>(receiver ? receiver : this);
    if (callbacks.progress) {
        connect(watcher, &QFutureWatcherBase::progressValueChanged, watcher,
                [watcher, progress = callbacks.progress](int percent) {
                    if (!watcher->isCanceled()) progress(percent);
                });
    }
    connect(watcher, &QFutureWatcherBase::finished, watcher,
            [watcher, callbacks = std::move(callbacks)] {
                watcher->deleteLater();
                QFuture<Result> future = watcher->future();
                if (future.isCanceled() || future.resultCount() == 0) return;
                Result outcome = future.takeResult();
                if (outcome.value) {
                    if (callbacks.done) callbacks.done(std::move(*outcome.value));
                } else if (callbacks.failed) {
                    callbacks.failed(outcome.error);
                }
            });
    // The watcher follows the job before it starts, so it misses none of its progress.
    auto promise = std::make_shared<QPromise<Result>>();
    const QFuture<Result> future = promise->future();
    watcher->setFuture(future);
    Track(QFuture<void>(future));
    pool_.start([promise, work = std::move(work)] {
        promise->start();
        promise->setProgressRange(0, 100);
        if (!promise->isCanceled()) {
            PromiseControl<T> control(*promise);
            try {
                promise->addResult(Result{work(control), QString()});
            } catch (const std::exception& error) {
                promise->addResult(Result{std::nullopt, QString::fromLocal8Bit(error.what())});
            }
        }
        promise->finish();
    });
    return Job(QFuture<void>(future));
}
