#pragma once

#include "components/audio/devices/rtaudio_stream.h"

#include <atomic>

// Mono or stereo float recording through RtAudio at the device's own rate. A mono device gives
// one channel even when two are asked for; format() tells.
class RtAudioInputDevice : public AudioInputDevice {
  public:
    RtAudioInputDevice(AudioApi api, const QString& deviceName, int channels,
                       int periodFrames = 256);
    ~RtAudioInputDevice() override;

    bool open();
    bool start(AudioCaptureSink& sink) override;
    void stop() override;
    bool isRunning() const override { return stream_.isRunning(); }
    AudioStreamFormat format() const override { return stream_.format(); }
    QString description() const override { return stream_.description(); }
    QString errorText() const override { return stream_.errorText(); }

    // Periods of which the device reported recorded frames lost.
    int overflowCount() const { return overflows_.load(std::memory_order_relaxed); }

  private:
    static int Callback(void* output, void* input, unsigned int frames, double time,
                        unsigned int status, void* self);

    RtAudioStream stream_;
    AudioCaptureSink* sink_ = nullptr;
    int channels_ = 1;
    std::atomic<int> overflows_{0};
};
