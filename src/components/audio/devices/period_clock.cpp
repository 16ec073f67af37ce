#include "components/audio/devices/period_clock.h"

#include <chrono>
#include <cstdint>

namespace {

using Clock = std::chrono::steady_clock;

// The time `frames` frames take, split so the product cannot overflow in a long run.
std::chrono::nanoseconds FramesToTime(std::int64_t frames, int sampleRate) {
    constexpr std::int64_t kNanosecondsPerSecond = 1'000'000'000;
    return std::chrono::nanoseconds((frames / sampleRate) * kNanosecondsPerSecond +
                                    (frames % sampleRate) * kNanosecondsPerSecond / sampleRate);
}

// A thread held up longer than this starts counting afresh, as a sound card drops what it
// missed, rather than racing through the backlog.
constexpr int kMaxPeriodsBehind = 8;

}  // namespace

bool PeriodClock::start(int sampleRate, int periodFrames, std::function<void()> onPeriod) {
    if (isRunning() || sampleRate <= 0 || periodFrames <= 0 || !onPeriod) return false;
    onPeriod_ = std::move(onPeriod);
    running_.store(true);
    thread_ = std::thread(&PeriodClock::Run, this, sampleRate, periodFrames);
    return true;
}

void PeriodClock::stop() {
    running_.store(false);
    if (thread_.joinable()) thread_.join();
    onPeriod_ = nullptr;
}

void PeriodClock::Run(int sampleRate, int periodFrames) {
    Clock::time_point origin = Clock::now();
    std::int64_t frames = 0;
    const auto period = FramesToTime(periodFrames, sampleRate);
    while (running_.load(std::memory_order_relaxed)) {
        onPeriod_();
        frames += periodFrames;
        Clock::time_point deadline = origin + FramesToTime(frames, sampleRate);
        if (Clock::now() - deadline > kMaxPeriodsBehind * period) {
            origin = Clock::now();
            frames = 0;
            deadline = origin;
        }
        std::this_thread::sleep_until(deadline);
    }
}
