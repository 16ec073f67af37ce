#include "app/startup_trace.h"

#include <QEvent>
#include <QTimer>
#include <QWidget>

#include <cstdio>

namespace {

// The system's monotonic clock, the same in every process, so another process can compare.
qint64 MonotonicMilliseconds() {
    QElapsedTimer now;
    now.start();
    return now.msecsSinceReference();
}

}  // namespace

StartupTrace& StartupTrace::instance() {
    static StartupTrace trace;
    return trace;
}

StartupTrace::StartupTrace() : enabled_(qEnvironmentVariableIntValue("OQ_TRACE_STARTUP") == 1) {}

void StartupTrace::mark(const char* name) {
    if (!enabled_) return;
    std::printf("%s %lld\n", name, static_cast<long long>(MonotonicMilliseconds()));
    std::fflush(stdout);
}

void StartupTrace::watchFirstPaint(QWidget* widget, const char* name) {
    if (!enabled_) return;
    widget->setProperty("oqTraceName", QByteArray(name));
    widget->installEventFilter(this);
}

bool StartupTrace::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() == QEvent::Paint) {
        const QByteArray name = watched->property("oqTraceName").toByteArray();
        watched->removeEventFilter(this);
        // After this paint returns the frame is on screen; a zero-time timer runs right after it.
        QTimer::singleShot(0, this, [this, name] { mark(name.constData()); });
    }
    return QObject::eventFilter(watched, event);
}

void StartupTrace::startStallWatch() {
    if (!enabled_) return;
    auto* timer = new QTimer(this);
    timer->setTimerType(Qt::PreciseTimer);
    connect(timer, &QTimer::timeout, this, &StartupTrace::Tick);
    lastTick_ = reportedAt_ = MonotonicMilliseconds();
    timer->start(1);
}

void StartupTrace::Tick() {
    const qint64 now = MonotonicMilliseconds();
    longestGap_ = std::max(longestGap_, now - lastTick_);
    lastTick_ = now;
    if (now - reportedAt_ >= 1000) {
        std::printf("ui-block-ms %lld %lld\n", static_cast<long long>(longestGap_),
                    static_cast<long long>(now));
        std::fflush(stdout);
        longestGap_ = 0;
        reportedAt_ = now;
    }
}
