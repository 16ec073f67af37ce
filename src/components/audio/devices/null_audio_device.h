#pragma once

#include "components/audio/devices/audio_device.h"
#include "components/audio/devices/period_clock.h"

#include <vector>

// Plays into nothing at real time: the mixer runs, pads start, end and report as on a sound
// card. Used when no sound device can be opened or none is wanted.
class NullOutputDevice : public AudioOutputDevice {
  public:
    explicit NullOutputDevice(AudioStreamFormat format = {});
    ~NullOutputDevice() override { stop(); }

    bool start(AudioRenderer& renderer) override;
    void stop() override { clock_.stop(); }
    bool isRunning() const override { return clock_.isRunning(); }
    AudioStreamFormat format() const override { return format_; }
    QString description() const override { return QStringLiteral("no sound device"); }
    QString errorText() const override { return QString(); }

  private:
    AudioStreamFormat format_;
    std::vector<float> period_;
    PeriodClock clock_;
};

// Records silence at real time, for a machine without a recording device.
class NullInputDevice : public AudioInputDevice {
  public:
    explicit NullInputDevice(AudioStreamFormat format = {});
    ~NullInputDevice() override { stop(); }

    bool start(AudioCaptureSink& sink) override;
    void stop() override { clock_.stop(); }
    bool isRunning() const override { return clock_.isRunning(); }
    AudioStreamFormat format() const override { return format_; }
    QString description() const override { return QStringLiteral("no recording device"); }
    QString errorText() const override { return QString(); }

  private:
    AudioStreamFormat format_;
    std::vector<float> silence_;
    PeriodClock clock_;
};
