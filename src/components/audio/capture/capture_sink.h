#pragma once

#include "components/audio/capture/resampler.h"
#include "components/audio/capture/sample_ring.h"
#include "components/audio/capture/scope_exchange.h"
#include "components/audio/devices/audio_device.h"

#include <atomic>
#include <cstdint>
#include <vector>

// Left and right peak levels, 0..1; a mono take shows the same level on both.
struct CaptureLevels {
    float left = 0.0f;
    float right = 0.0f;
};

// The recording end of an input device. On the device's thread it turns what the device records
// into the take's format (channels averaged or duplicated, then resampled to the take's rate),
// raises the peak levels, fills the oscilloscope block and queues the samples for the file writer.
// Frames that find the queue full are dropped and counted.
class CaptureSink : public AudioCaptureSink {
  public:
    // Five seconds of stereo at 44100 Hz and more: room for the disk to stall.
    static constexpr std::size_t kRingSamples = std::size_t(1) << 19;
    // The callback works through what it is given in pieces of this many device frames.
    static constexpr int kChunkFrames = 512;

    CaptureSink();

    // Only while no device calls capture(): the device's rate and the take's format. Empties the
    // queue, the levels, the oscilloscope and the lost count.
    void configure(int deviceRate, int takeRate, int takeChannels);
    // Only while no device calls capture(): pushes the resampler's last frames out with silence.
    void finish();

    int takeRate() const { return takeRate_; }
    int takeChannels() const { return takeChannels_; }

    // The device's thread.
    void capture(const float* samples, int frames, int channels) noexcept override;

    // The writer's side of the queue: interleaved take frames.
    SampleRing& queue() { return ring_; }
    // Any thread.
    std::int64_t lostFrames() const { return lost_.load(std::memory_order_relaxed); }
    // One reader: the peaks since the previous call.
    CaptureLevels takeLevels();
    // The user-interface thread.
    const ScopeBlock& latestBlock() { return scope_.latest(); }

  private:
    void convertChannels(const float* samples, int frames, int channels) noexcept;
    void deliver(const float* samples, int frames) noexcept;
    void raisePeaks(const float* samples, int frames) noexcept;
    void feedScope(const float* samples, int frames) noexcept;

    int takeRate_ = 44100;
    int takeChannels_ = 2;
    Resampler resampler_;
    SampleRing ring_;
    ScopeExchange scope_;
    std::vector<float> converted_;
    std::vector<float> resampled_;
    int resampledFrames_ = 0;
    std::atomic<float> peakLeft_{0.0f};
    std::atomic<float> peakRight_{0.0f};
    std::atomic<std::int64_t> lost_{0};
};
