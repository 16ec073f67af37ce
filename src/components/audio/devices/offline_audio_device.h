#pragma once

#include "components/audio/devices/audio_device.h"

#include <vector>

// The test device: nothing runs by itself; the test pulls the output period by period and
// pushes recorded input, on its own thread, as a sound card's callback would.
class OfflineAudioDevice : public AudioOutputDevice, public AudioInputDevice {
  public:
    explicit OfflineAudioDevice(AudioStreamFormat format = {}) : format_(format) {}

    bool start(AudioRenderer& renderer) override {
        renderer_ = &renderer;
        return true;
    }
    bool start(AudioCaptureSink& sink) override {
        sink_ = &sink;
        return true;
    }
    void stop() override {
        renderer_ = nullptr;
        sink_ = nullptr;
    }
    bool isRunning() const override { return renderer_ || sink_; }
    AudioStreamFormat format() const override { return format_; }
    QString description() const override { return QStringLiteral("offline"); }
    QString errorText() const override { return QString(); }

    // Renders the next period (interleaved stereo) and returns it.
    const std::vector<float>& pull() {
        period_.assign(static_cast<std::size_t>(format_.periodFrames) * 2, 0.0f);
        if (renderer_) renderer_->render(period_.data(), format_.periodFrames);
        return period_;
    }
    // Renders `periods` periods and returns them one after another.
    std::vector<float> pull(int periods) {
        std::vector<float> all;
        all.reserve(static_cast<std::size_t>(periods) * format_.periodFrames * 2);
        for (int i = 0; i < periods; ++i) {
            const std::vector<float>& one = pull();
            all.insert(all.end(), one.begin(), one.end());
        }
        return all;
    }
    // Hands recorded frames to the capture sink.
    void push(const float* samples, int frames) {
        if (sink_) sink_->capture(samples, frames, format_.channels);
    }

  private:
    AudioStreamFormat format_;
    AudioRenderer* renderer_ = nullptr;
    AudioCaptureSink* sink_ = nullptr;
    std::vector<float> period_;
};
