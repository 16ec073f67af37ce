#pragma once

#include "components/audio/playback/sample_cache.h"
#include "components/audio/playback/wave_channel.h"
#include "components/audio/playback/wave_mixer.h"
#include "components/worker/background_jobs.h"

#include <QElapsedTimer>
#include <QTimer>

#include <array>
#include <memory>

class EngineWaveChannels;

// A wave channel of the mixer, as the user-interface thread sees it. Files handed over by load,
// and large ones at a press, decode on the worker; a start made meanwhile waits for the sound.
class MixerWaveChannel : public WaveChannel {
  public:
    MixerWaveChannel(EngineWaveChannels& owner, int voice);

    bool setFileName(const QString& path) override;
    bool load(const QString& path) override;
    FileReadiness prepare(const QString& path) override;
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
    bool isDecoding() const { return decoding_; }

    float peakLeft() const override { return mixer_.peakLeft(voice_); }
    float peakRight() const override { return mixer_.peakRight(voice_); }
    // The loaded sound's length in frames and its own rate (0 without a sound).
    std::int64_t frames() const { return buffer_ ? buffer_->frames : 0; }
    int fileRate() const { return buffer_ ? buffer_->sampleRate : 0; }

    void playbackEnded();

  private:
    void Take(const QString& path, std::shared_ptr<const SampleBuffer> buffer);
    void Fail(const QString& error);
    void StartDecode(const QString& path, const QFileInfo& info);
    void CancelDecode();
    void Decoded(quint64 decode, const QString& path, const SampleCache::Stamp& stamp,
                 LoadedSamples loaded);

    EngineWaveChannels& owner_;
    WaveMixer& mixer_;
    SampleCache& cache_;
    int voice_;
    std::shared_ptr<const SampleBuffer> buffer_;
    QString fileName_;  // the sound's file, or the one decoding
    QString lastError_;
    int volume_ = 0;
    int pan_ = 0;
    bool playing_ = false;
    bool decoding_ = false;
    bool startWhenDecoded_ = false;
    quint64 latestDecode_ = 0;  // a result of any other decode was overtaken and is dropped
    Job decode_;
};

// The sixteen pad channels and the editor's player over one mixer. The mixer's reports are
// collected every few milliseconds on the user-interface thread; decodes run on a worker of
// their own and report back there too.
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
    friend class MixerWaveChannel;
    // Decodes longer than this show their progress.
    static constexpr int kMomentMilliseconds = 300;

    void Ended(int voice);
    void DecodeBegins(int voice);
    void DecodeAdvanced(int voice, int percent);
    void DecodeEnds(int voice);  // done, failed or cancelled
    void Loaded(int voice, bool ok, const QString& error);
    void ReportProgress();

    WaveMixer& mixer_;
    SampleCache cache_;
    std::array<std::unique_ptr<MixerWaveChannel>, WaveMixer::kVoices> channels_;
    QTimer timer_;
    // Destroyed before the channels, so no decode outlives them.
    BackgroundJobs jobs_{2};
    // The decodes since none was under way: each voice's percent (-1 when it decodes nothing).
    std::array<int, WaveMixer::kVoices> decodePercent_;
    int batchBegun_ = 0;
    int batchEnded_ = 0;
    QElapsedTimer batchClock_;
    bool progressShown_ = false;
};
