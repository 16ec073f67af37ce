#pragma once

#include "components/audio/playback/wave_channel.h"

#include <QStringList>

#include <array>
#include <memory>

// The test backend: channels that make no sound and keep a log of every call made to them,
// one line per call ("60 file /a.wav", "60 start", ...). A test can make loading fail and can
// end a sound as the audio thread would.
class RecordingWaveChannel : public WaveChannel {
  public:
    RecordingWaveChannel(int note, QStringList& log) : note_(note), log_(log) {}

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

    // Paths that fail to load, as a missing or unreadable file would.
    QStringList unloadableFiles;
    bool failStart = false;
    int frequency = 0;
    bool looping = false;
    int volume = 0;
    int pan = 0;

    void finishPlayback() { playing_ = false; }

  private:
    void record(const QString& what);

    int note_;
    QStringList& log_;
    QString fileName_;
    QString lastError_;
    bool playing_ = false;
};

class RecordingWaveChannels : public WaveChannels {
    Q_OBJECT
  public:
    explicit RecordingWaveChannels(QObject* parent = nullptr);
    RecordingWaveChannel& channel(int padNote) override;

    // Ends a pad's sound by itself and delivers the notice, as the real mixer does.
    void endPlayback(int padNote);

    QStringList log;

  private:
    std::array<std::unique_ptr<RecordingWaveChannel>, 16> channels_;
};
