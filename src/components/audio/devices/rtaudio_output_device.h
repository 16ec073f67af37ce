#pragma once

#include "components/audio/devices/rtaudio_stream.h"

#include <atomic>

// Stereo float playback through RtAudio at the device's own rate. JACK sets the rate and period
// itself; elsewhere the period is the one asked for.
class RtAudioOutputDevice : public AudioOutputDevice {
  public:
    RtAudioOutputDevice(AudioApi api, const QString& deviceName, int periodFrames = 256);
    ~RtAudioOutputDevice() override;

    // Opens the stream without starting it, so the mixer can learn the rate first.
    bool open();
    // Opens the stream when open() was not called, then starts calling the renderer.
    bool start(AudioRenderer& renderer) override;
    void stop() override;
    bool isRunning() const override { return stream_.isRunning(); }
    AudioStreamFormat format() const override { return stream_.format(); }
    QString description() const override { return stream_.description(); }
    QString errorText() const override { return stream_.errorText(); }

    // Periods the device reported as played late (gaps in the sound).
    int underflowCount() const { return underflows_.load(std::memory_order_relaxed); }

  private:
    static int Callback(void* output, void* input, unsigned int frames, double time,
                        unsigned int status, void* self);

    RtAudioStream stream_;
    AudioRenderer* renderer_ = nullptr;
    std::atomic<int> underflows_{0};
};
