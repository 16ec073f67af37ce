#pragma once

#include "components/audio/devices/audio_device.h"
#include "components/audio/playback/engine_wave_channels.h"
#include "components/audio/playback/wave_mixer.h"
#include "components/settings/settings_store.h"

#include <QObject>
#include <QString>

#include <memory>

// The program's sound: the mixer with the pads' channels and the editor's player, the output
// device it plays through and, while recording, an input device. When the chosen device cannot
// be opened the engine plays silently at real time and says so in a status notice.
class AudioEngine : public QObject {
    Q_OBJECT
  public:
    // Plays through the devices chosen in the settings group "Audio".
    explicit AudioEngine(const SettingsStore& settings, QObject* parent = nullptr);
    // Plays through `output` (tests: the offline device) and records from `input`, or from
    // silence without one.
    explicit AudioEngine(std::unique_ptr<AudioOutputDevice> output,
                         std::unique_ptr<AudioInputDevice> input = nullptr,
                         QObject* parent = nullptr);
    ~AudioEngine() override;

    // Opens the output and starts it. False when it plays on the null device instead.
    bool start();
    // Stops the output and forgets every sound that was playing.
    void stop();
    // Stops and starts again with the settings as they are now.
    bool restart();
    bool isRunning() const { return output_ != nullptr; }

    // Starts recording into `sink`, mono or stereo; false when it records silence instead.
    bool startCapture(AudioCaptureSink& sink, int channels);
    void stopCapture();

    EngineWaveChannels& channels() { return channels_; }
    WaveMixer& mixer() { return mixer_; }
    // The running devices, or null.
    AudioOutputDevice* outputDevice() const { return output_; }
    AudioInputDevice* inputDevice() const { return input_; }
    // "JACK 48 kHz 5.3 ms", "no sound device"; "" while stopped.
    QString outputDescription() const;

  signals:
    // A short notice for the status bar.
    void statusNotice(const QString& text);

  private:
    bool Play(AudioOutputDevice& device);
    int PeriodFrames() const;

    const SettingsStore* settings_ = nullptr;
    WaveMixer mixer_;
    EngineWaveChannels channels_;
    std::unique_ptr<AudioOutputDevice> injectedOutput_;
    std::unique_ptr<AudioInputDevice> injectedInput_;
    std::unique_ptr<AudioOutputDevice> openedOutput_;
    std::unique_ptr<AudioInputDevice> openedInput_;
    AudioOutputDevice* output_ = nullptr;
    AudioInputDevice* input_ = nullptr;
};
