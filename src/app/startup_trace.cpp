#include "app/startup_trace.h"

#include <QApplication>
#include <QDialog>
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
    firstPaints_.insert(widget, QByteArray(name));
    qApp->installEventFilter(this);
}

void StartupTrace::watchPlayable(QWidget* window) {
    if (!enabled_) return;
    playable_ = window;
    qApp->installEventFilter(this);
}

bool StartupTrace::eventFilter(QObject* watched, QEvent* event) {
    const auto* dialog = qobject_cast<QDialog*>(watched);
    const bool prompt = playable_ && dialog && dialog->isWindow();
    bool playableMayChange = false;
    switch (event->type()) {
        case QEvent::Paint:
            // After this paint returns the frame is on screen; a zero-time timer runs right
            // after it.
            if (const QByteArray name = firstPaints_.take(watched); !name.isEmpty())
                QTimer::singleShot(0, this, [this, name] { mark(name.constData()); });
            if (watched == playable_) playableMayChange = playablePainted_ = true;
            break;
        case QEvent::WindowActivate:
            playableMayChange = watched == playable_;
            break;
        case QEvent::Show:
            if (prompt && !prompts_.contains(watched)) {
                prompts_.insert(watched);
                firstPaints_.insert(watched, "prompt-shown");
            }
            break;
        case QEvent::Hide:
            if (prompt && prompts_.remove(watched)) {
                mark("prompt-closed");
                playableMayChange = true;
            }
            break;
        default:
            break;
    }
    if (playableMayChange) QTimer::singleShot(0, this, &StartupTrace::CheckPlayable);
    return QObject::eventFilter(watched, event);
}

void StartupTrace::CheckPlayable() {
    if (!playable_ || !playablePainted_ || !playable_->isActiveWindow() ||
        QApplication::activeModalWidget())
        return;
    mark("window-playable");
    playable_ = nullptr;
    // Nothing more to watch: every later event goes straight to its receiver again.
    if (firstPaints_.isEmpty()) qApp->removeEventFilter(this);
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
