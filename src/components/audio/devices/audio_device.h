#pragma once

#include <QString>

// What a sound device asks of the program on its real-time thread. Implementations never
// allocate, lock, log or touch a file in these calls.
class AudioRenderer {
  public:
    virtual ~AudioRenderer() = default;
    // Fill `frames` interleaved stereo frames (left, right) of float samples in -1..1.
    virtual void render(float* stereo, int frames) noexcept = 0;
};

class AudioCaptureSink {
  public:
    virtual ~AudioCaptureSink() = default;
    // `frames` interleaved frames of `channels` float samples, as the device recorded them.
    virtual void capture(const float* samples, int frames, int channels) noexcept = 0;
};

// The clock and format a running output or input stream works at.
struct AudioStreamFormat {
    int sampleRate = 48000;
    int periodFrames = 256;
    int channels = 2;
};

// A playback stream: stereo, float, at the device's own rate. start() begins calling the
// renderer on the device's thread once per period.
class AudioOutputDevice {
  public:
    virtual ~AudioOutputDevice() = default;
    virtual bool start(AudioRenderer& renderer) = 0;
    virtual void stop() = 0;
    virtual bool isRunning() const = 0;
    virtual AudioStreamFormat format() const = 0;
    // "JACK 48 kHz 5.3 ms", "no sound device": shown at the right end of the status bar.
    virtual QString description() const = 0;
    virtual QString errorText() const = 0;
};

// A recording stream at the device's own rate, mono or stereo.
class AudioInputDevice {
  public:
    virtual ~AudioInputDevice() = default;
    virtual bool start(AudioCaptureSink& sink) = 0;
    virtual void stop() = 0;
    virtual bool isRunning() const = 0;
    virtual AudioStreamFormat format() const = 0;
    virtual QString description() const = 0;
    virtual QString errorText() const = 0;
};
