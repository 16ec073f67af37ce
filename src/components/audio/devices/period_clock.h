#pragma once

#include <atomic>
#include <functional>
#include <thread>

// Calls a function once per period on a thread of its own, keeping real time by the steady
// clock: each call has a deadline counted from the start, so rounding never adds up to drift.
// This is the sound card of the null devices.
class PeriodClock {
  public:
    PeriodClock() = default;
    ~PeriodClock() { stop(); }
    PeriodClock(const PeriodClock&) = delete;
    PeriodClock& operator=(const PeriodClock&) = delete;

    // `onPeriod` runs on the clock's thread and must not block.
    bool start(int sampleRate, int periodFrames, std::function<void()> onPeriod);
    // Returns within about one period.
    void stop();
    bool isRunning() const { return thread_.joinable(); }

  private:
    void Run(int sampleRate, int periodFrames);

    std::function<void()> onPeriod_;
    std::atomic<bool> running_{false};
    std::thread thread_;
};
