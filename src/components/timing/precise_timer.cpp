#include "components/timing/precise_timer.h"

#include <algorithm>

PreciseTimer::PreciseTimer(QObject* parent) : QObject(parent) {
    timer_.setSingleShot(true);
    timer_.setTimerType(Qt::PreciseTimer);
    connect(&timer_, &QTimer::timeout, this, &PreciseTimer::Fire);
}

void PreciseTimer::setInterval(int milliseconds) {
    interval_ = std::chrono::milliseconds(std::max(milliseconds, 1));
    if (enabled_) {
        next_ = Clock::now() + interval_;
        ScheduleNext();
    }
}

void PreciseTimer::setEnabled(bool enabled) {
    if (enabled == enabled_) return;
    enabled_ = enabled;
    if (!enabled_) {
        timer_.stop();
        return;
    }
    next_ = Clock::now() + interval_;
    ScheduleNext();
}

void PreciseTimer::ScheduleNext() {
    const auto wait = std::chrono::duration_cast<std::chrono::milliseconds>(next_ - Clock::now());
    timer_.start(static_cast<int>(std::max<std::chrono::milliseconds::rep>(wait.count(), 0)));
}

void PreciseTimer::Fire() {
    if (!enabled_) return;
    // QTimer may wake a little early; wait out the rest instead of firing ahead of the beat.
    if (Clock::now() < next_) {
        ScheduleNext();
        return;
    }
    next_ += interval_;
    const auto now = Clock::now();
    if (next_ <= now) {
        // More than a whole interval behind: skip the missed beats, keep the grid.
        const auto behind = now - next_;
        next_ += interval_ * (behind / interval_ + 1);
    }
    ScheduleNext();
    emit tick();
}
