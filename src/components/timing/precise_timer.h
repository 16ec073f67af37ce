#pragma once

#include <QObject>
#include <QTimer>

#include <chrono>

// A tick every interval on the user-interface thread, scheduled against a steady clock: each
// tick is aimed at start + n * interval, so late ticks do not push the later ones back and a
// metronome keeps its tempo over minutes. A tick that is more than a whole interval late is
// dropped rather than fired twice in a row.
class PreciseTimer : public QObject {
    Q_OBJECT
  public:
    explicit PreciseTimer(QObject* parent = nullptr);

    void setInterval(int milliseconds);
    int interval() const { return static_cast<int>(interval_.count()); }
    void setEnabled(bool enabled);
    bool isEnabled() const { return enabled_; }

  signals:
    void tick();

  private:
    void ScheduleNext();
    void Fire();

    using Clock = std::chrono::steady_clock;
    QTimer timer_;
    std::chrono::milliseconds interval_{100};
    Clock::time_point next_;
    bool enabled_ = false;
};
