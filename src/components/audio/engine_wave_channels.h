#pragma once

#include "components/audio/sample_cache.h"
#include "components/audio/wave_channel.h"
#include "components/audio/wave_mixer.h"

#include <QTimer>

#include <array>
#include <memory>

// A wave channel of the mixer, as the user-interface thread sees it.
class MixerWaveChannel : public WaveChannel {
  public:
    MixerWaveChannel(WaveMixer& mixer, SampleCache& cache, int voice)
        : mixer_(mixer), cache_(cache), voice_(voice) {}

    bool setFileName(const QString& path) override;
    QString fileName() const override { return fileName_; }
    QString lastError() const override { return lastError_; }
    void setFrequency(int hertz) override;
    void setLooping(bool looping) override;
    void setVolume(int volume) override;
    void setPan(int pan) override;
    bool start() override;
    void stop() override;
    void close() override;
    bool isPlaying() const override { return playing_; }

    float peakLeft() const override { return mixer_.peakLeft(voice_); }
    float peakRight() const override { return mixer_.peakRight(voice_); }
    // The loaded sound's length in frames and its own rate (0 without a sound).
    std::int64_t frames() const { return buffer_ ? buffer_->frames : 0; }
    int fileRate() const { return buffer_ ? buffer_->sampleRate : 0; }

    void playbackEnded() { playing_ = false; }

  private:
    WaveMixer& mixer_;
    SampleCache& cache_;
    int voice_;
    std::shared_ptr<const SampleBuffer> buffer_;
    QString fileName_;
    QString lastError_;
    int volume_ = 0;
    int pan_ = 0;
    bool playing_ = false;
};

// The sixteen pad channels and the editor's player over one mixer. The mixer's reports are
// collected every few milliseconds on the user-interface thread.
class EngineWaveChannels : public WaveChannels {
    Q_OBJECT
  public:
    explicit EngineWaveChannels(WaveMixer& mixer, QObject* parent = nullptr);

    MixerWaveChannel& channel(int padNote) override;
    MixerWaveChannel& player() { return *channels_[WaveMixer::kPlayerVoice]; }

    // Delivers ended sounds and frees buffers the audio thread let go; the timer calls it.
    void collectEvents();
    // The device stopped and the mixer forgot its sounds: every channel that was playing has
    // ended, and says so.
    void soundsCutOff();

  signals:
    void playerEnded();

  private:
    void Ended(int voice);

    WaveMixer& mixer_;
    SampleCache cache_;
    std::array<std::unique_ptr<MixerWaveChannel>, WaveMixer::kVoices> channels_;
    QTimer timer_;
};
