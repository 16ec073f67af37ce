#include "components/audio/capture/resampler.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace {

// Zero crossings of the sinc on each side, and the Kaiser shape: together about 90 dB of stopband.
constexpr int kZeroCrossings = 20;
constexpr double kKaiserBeta = 8.6;
// The passband ends a little below the lower Nyquist frequency, leaving room for the transition.
constexpr double kPassbandShare = 0.90;
constexpr int kStepsPerZeroCrossing = 512;

double Sinc(double x) {
    if (std::abs(x) < 1e-12) return 1.0;
    return std::sin(std::numbers::pi * x) / (std::numbers::pi * x);
}

double Kaiser(double position) {  // position in -1..1
    const double inside = std::max(0.0, 1.0 - position * position);
    return std::cyl_bessel_i(0.0, kKaiserBeta * std::sqrt(inside)) /
           std::cyl_bessel_i(0.0, kKaiserBeta);
}

}  // namespace

void Resampler::configure(int inRate, int outRate, int channels) {
    inRate_ = std::max(inRate, 1);
    outRate_ = std::max(outRate, 1);
    channels_ = std::clamp(channels, 1, kMaxChannels);
    // Cut-off in cycles per input frame: just under half the lower of the two rates.
    const double cutoff = 0.5 * kPassbandShare * std::min(1.0, double(outRate_) / inRate_);
    const double halfWidth = kZeroCrossings / (2.0 * cutoff);
    reach_ = static_cast<int>(std::ceil(halfWidth));
    stepsPerFrame_ = kStepsPerZeroCrossing * 2.0 * cutoff;
    const int steps = static_cast<int>(std::ceil(reach_ * stepsPerFrame_)) + 2;
    table_.assign(static_cast<std::size_t>(steps), 0.0f);
    for (int i = 0; i < steps; ++i) {
        const double distance = i / stepsPerFrame_;
        if (distance >= halfWidth) break;
        table_[i] = static_cast<float>(2.0 * cutoff * Sinc(2.0 * cutoff * distance) *
                                       Kaiser(distance / halfWidth));
    }
    std::int64_t size = 1;
    while (size < 2 * reach_ + 2) size *= 2;
    historyMask_ = size - 1;
    history_.assign(static_cast<std::size_t>(size * channels_), 0.0f);
    reset();
}

void Resampler::reset() {
    std::fill(history_.begin(), history_.end(), 0.0f);
    inputCount_ = 0;
    nextWhole_ = 0;
    nextRemainder_ = 0;
}

int Resampler::maxOutputFrames(int inputFrames) const {
    return static_cast<int>(std::int64_t(inputFrames) * outRate_ / inRate_) + 2;
}

float Resampler::tap(double distance) const {
    const double at = std::abs(distance) * stepsPerFrame_;
    const auto index = static_cast<std::size_t>(at);
    if (index + 1 >= table_.size()) return 0.0f;
    const float share = static_cast<float>(at - index);
    return table_[index] + share * (table_[index + 1] - table_[index]);
}

int Resampler::process(const float* in, int frames, float* out, int maxOut) noexcept {
    if (passesThrough()) {
        const int n = std::min(frames, maxOut);
        std::copy_n(in, static_cast<std::size_t>(n) * channels_, out);
        return n;
    }
    int written = 0;
    for (int f = 0; f < frames; ++f) {
        const std::int64_t slot = inputCount_ & historyMask_;
        for (int c = 0; c < channels_; ++c) history_[slot * channels_ + c] = in[f * channels_ + c];
        ++inputCount_;
        // Emit every output instant whose filter window the input now covers.
        while (nextWhole_ + reach_ < inputCount_) {
            if (written < maxOut) {
                const double fraction = double(nextRemainder_) / outRate_;
                float sums[kMaxChannels] = {};
                for (std::int64_t n = nextWhole_ - reach_ + 1; n <= nextWhole_ + reach_; ++n) {
                    const float weight = tap(double(nextWhole_ - n) + fraction);
                    const float* frame = &history_[(n & historyMask_) * channels_];
                    for (int c = 0; c < channels_; ++c) sums[c] += weight * frame[c];
                }
                for (int c = 0; c < channels_; ++c) out[written * channels_ + c] = sums[c];
                ++written;
            }
            nextWhole_ += inRate_ / outRate_;
            nextRemainder_ += inRate_ % outRate_;
            if (nextRemainder_ >= outRate_) {
                nextRemainder_ -= outRate_;
                ++nextWhole_;
            }
        }
    }
    return written;
}
