#include "components/audio/capture/capture_sink.h"

#include <algorithm>
#include <cmath>

namespace {

void RaiseTo(std::atomic<float>& peak, float level) noexcept {
    float seen = peak.load(std::memory_order_relaxed);
    while (level > seen && !peak.compare_exchange_weak(seen, level, std::memory_order_relaxed)) {
    }
}

}  // namespace

CaptureSink::CaptureSink() : ring_(kRingSamples) {
    configure(44100, takeRate_, takeChannels_);
}

void CaptureSink::configure(int deviceRate, int takeRate, int takeChannels) {
    takeRate_ = takeRate;
    takeChannels_ = std::clamp(takeChannels, 1, 2);
    resampler_.configure(deviceRate, takeRate_, takeChannels_);
    converted_.assign(static_cast<std::size_t>(kChunkFrames) * takeChannels_, 0.0f);
    resampledFrames_ = resampler_.maxOutputFrames(kChunkFrames);
    resampled_.assign(static_cast<std::size_t>(resampledFrames_) * takeChannels_, 0.0f);
    ring_.clear();
    scope_.clear();
    peakLeft_ = 0.0f;
    peakRight_ = 0.0f;
    lost_ = 0;
}

void CaptureSink::finish() {
    std::fill(converted_.begin(), converted_.end(), 0.0f);
    for (int left = resampler_.tailFrames(); left > 0; left -= kChunkFrames) {
        const int frames = std::min(left, kChunkFrames);
        deliver(resampled_.data(),
                resampler_.process(converted_.data(), frames, resampled_.data(), resampledFrames_));
    }
}

void CaptureSink::capture(const float* samples, int frames, int channels) noexcept {
    if (channels < 1) return;
    while (frames > 0) {
        const int chunk = std::min(frames, kChunkFrames);
        convertChannels(samples, chunk, channels);
        const int out =
            resampler_.process(converted_.data(), chunk, resampled_.data(), resampledFrames_);
        deliver(resampled_.data(), out);
        samples += static_cast<std::size_t>(chunk) * channels;
        frames -= chunk;
    }
}

void CaptureSink::convertChannels(const float* samples, int frames, int channels) noexcept {
    float* out = converted_.data();
    for (int f = 0; f < frames; ++f, samples += channels) {
        // Beyond the second, a device's channels are not part of the take.
        const float left = samples[0];
        const float right = channels > 1 ? samples[1] : left;
        if (takeChannels_ == 1) {
            *out++ = 0.5f * (left + right);
        } else {
            *out++ = left;
            *out++ = right;
        }
    }
}

void CaptureSink::deliver(const float* samples, int frames) noexcept {
    if (frames <= 0) return;
    raisePeaks(samples, frames);
    feedScope(samples, frames);
    const std::size_t count = static_cast<std::size_t>(frames) * takeChannels_;
    const std::size_t written = ring_.write(samples, count, takeChannels_);
    if (written < count) {
        lost_.fetch_add(static_cast<std::int64_t>((count - written) / takeChannels_),
                        std::memory_order_relaxed);
    }
}

void CaptureSink::raisePeaks(const float* samples, int frames) noexcept {
    float left = 0.0f;
    float right = 0.0f;
    for (int f = 0; f < frames; ++f) {
        left = std::max(left, std::abs(samples[f * takeChannels_]));
        right = std::max(right, std::abs(samples[f * takeChannels_ + takeChannels_ - 1]));
    }
    RaiseTo(peakLeft_, std::min(left, 1.0f));
    RaiseTo(peakRight_, std::min(right, 1.0f));
}

void CaptureSink::feedScope(const float* samples, int frames) noexcept {
    while (frames > 0) {
        ScopeBlock& block = scope_.back();
        block.channels = takeChannels_;
        const int n = std::min(frames, ScopeBlock::kFrames - block.frames);
        std::copy_n(samples, static_cast<std::size_t>(n) * takeChannels_,
                    block.samples.begin() + block.frames * takeChannels_);
        block.frames += n;
        samples += static_cast<std::size_t>(n) * takeChannels_;
        frames -= n;
        if (block.frames == ScopeBlock::kFrames) {
            scope_.publish();
            scope_.back().frames = 0;
        }
    }
}

CaptureLevels CaptureSink::takeLevels() {
    return {peakLeft_.exchange(0.0f, std::memory_order_relaxed),
            peakRight_.exchange(0.0f, std::memory_order_relaxed)};
}
