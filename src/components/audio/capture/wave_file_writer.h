#pragma once

#include "components/audio/capture/sample_ring.h"

#include <QString>

#include <atomic>
#include <cstdint>
#include <functional>
#include <thread>
#include <vector>

struct sf_private_tag;

// Writes a take as a 16-bit PCM wave file on a thread of its own, draining the capture queue.
// Four times a second it brings the header up to date and flushes the file to the disk, so that
// a crash or a power cut leaves a playable file that lacks at most the last half second.
class WaveFileWriter {
  public:
    using FailureHandler = std::function<void(const QString& reason)>;

    WaveFileWriter() = default;
    WaveFileWriter(const WaveFileWriter&) = delete;
    WaveFileWriter& operator=(const WaveFileWriter&) = delete;
    ~WaveFileWriter() { close(); }

    // Creates or replaces the file and starts draining `queue` (interleaved frames of `channels`
    // samples). False, with errorText(), when the file cannot be created. `onFailure` runs once on
    // the writer's thread when a write fails; the thread then stops writing.
    bool start(const QString& path, int channels, int rate, SampleRing& queue,
               FailureHandler onFailure);
    // Writes whatever is still queued, closes the file and joins the thread.
    void close();

    bool isOpen() const { return file_ != nullptr; }
    std::int64_t framesWritten() const { return framesWritten_.load(std::memory_order_relaxed); }
    QString errorText() const { return errorText_; }

  private:
    void run();
    bool drain();
    bool makeDurable();
    void fail(const QString& reason);

    sf_private_tag* file_ = nullptr;
    int descriptor_ = -1;
    int channels_ = 2;
    QString path_;
    QString errorText_;
    SampleRing* queue_ = nullptr;
    FailureHandler onFailure_;
    std::vector<float> block_;
    std::thread thread_;
    std::atomic<bool> stopping_{false};
    std::atomic<std::int64_t> framesWritten_{0};
};
