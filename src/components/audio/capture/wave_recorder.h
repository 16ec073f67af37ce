#pragma once

#include "components/audio/capture/capture_bands.h"
#include "components/audio/capture/capture_sink.h"
#include "components/audio/capture/wave_file_writer.h"
#include "components/audio/devices/audio_device.h"

#include <QObject>
#include <QString>
#include <QTimer>

// The recorder's wave input and wave file writer: records what an input device hears into a
// 16-bit wave file, mono or stereo, at the take's rate, and feeds the meters, the oscilloscope and
// the spectrum while it does. Everything here runs on the user-interface thread; the device's
// thread and the writer's thread stay inside the sink and the writer.
class WaveRecorder : public QObject {
    Q_OBJECT
  public:
    explicit WaveRecorder(AudioInputDevice& device, QObject* parent = nullptr);
    ~WaveRecorder() override;

    // Creates or replaces `path` and records into it: `channels` 1 or 2, `sampleRate` in Hz
    // (11025, 22050 or 44100 for a take). False, with errorText(), when the file cannot be made
    // or the device does not start.
    bool start(const QString& path, int channels, int sampleRate);
    // Writes what is still on its way, closes the file and releases the device.
    void stop();
    bool isRecording() const { return recording_; }
    QString errorText() const { return errorText_; }

    // Time recorded so far (frames in the file over the rate); kept after the recording ends.
    qint64 recordedMilliseconds() const;
    // Frames that found the queue to the writer full and were dropped.
    qint64 lostFrames() const { return sink_.lostFrames(); }
    // The peak levels, 0..1, since the previous call.
    CaptureLevels takeLevels() { return sink_.takeLevels(); }
    // The latest stretch of recorded samples, at the take's rate; valid until the next call of
    // oscilloscope() or spectrum().
    const ScopeBlock& oscilloscope() { return sink_.latestBlock(); }
    // The spectrum of that stretch; see CaptureSpectrum for the bands and units.
    CaptureSpectrum::Bands spectrum() { return spectrum_.compute(sink_.latestBlock()); }

  signals:
    // The recording ended without stop(): the disk is full, a write failed or the device went
    // away. The file is closed and plays up to where it ended.
    void stoppedByItself(const QString& reason);

  private:
    void endByItself(const QString& reason);
    void checkDevice();

    AudioInputDevice& device_;
    CaptureSink sink_;
    WaveFileWriter writer_;
    CaptureSpectrum spectrum_;
    QTimer deviceWatch_;
    bool recording_ = false;
    int takeCount_ = 0;
    QString errorText_;
};
