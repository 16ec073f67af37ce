// capture_lost_frames: a minute recorded through a real JACK server (dummy driver, 48 kHz,
// 64-frame periods, started here and stopped again by its process id) and an RtAudio JACK input
// stream into the wave recorder, resampled to a 44100 Hz stereo take on disk. The figure is the
// number of frames the capture queue had to drop; the target is 0.
#include "components/audio/capture/wave_recorder.h"

#include <RtAudio.h>
#include <benchmark/benchmark.h>
#include <sndfile.h>

#include <QCoreApplication>
#include <QFile>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QThread>

#include <atomic>
#include <chrono>
#include <memory>

namespace {

constexpr int kServerRate = 48000;
constexpr int kTakeRate = 44100;
constexpr auto kRecording = std::chrono::seconds(60);

// A private JACK server for the length of the benchmark.
class JackServer {
  public:
    JackServer()
        : name_(QStringLiteral("oq-capture-bench-%1").arg(QCoreApplication::applicationPid())) {}
    ~JackServer() {
        if (process_.state() == QProcess::NotRunning) return;
        process_.terminate();
        if (!process_.waitForFinished(5000)) process_.kill();
        process_.waitForFinished(2000);
    }

    // "" when it runs; otherwise why not.
    QString start() {
        if (QStandardPaths::findExecutable(QStringLiteral("jackd")).isEmpty())
            return QStringLiteral("jackd is not installed (Debian package jackd2)");
        qputenv("JACK_NO_START_SERVER", "1");
        // Its cycle-by-cycle reports would bury the table; they are shown when it fails.
        process_.setProcessChannelMode(QProcess::MergedChannels);
        process_.setStandardOutputFile(log_.filePath(QStringLiteral("jackd.log")));
        process_.start(
            QStringLiteral("jackd"),
            {QStringLiteral("-n"), name_, QStringLiteral("-S"), QStringLiteral("--no-realtime"),
             QStringLiteral("-d"), QStringLiteral("dummy"), QStringLiteral("-r"),
             QString::number(kServerRate), QStringLiteral("-p"), QStringLiteral("64")});
        if (!process_.waitForStarted(5000)) return QStringLiteral("jackd did not start");
        QProcess wait;
        wait.setProcessChannelMode(QProcess::MergedChannels);
        wait.start(QStringLiteral("jack_wait"), {QStringLiteral("-s"), name_, QStringLiteral("-w"),
                                                 QStringLiteral("-t"), QStringLiteral("10")});
        if (!wait.waitForFinished(15000) || wait.exitCode() != 0) {
            QFile log(log_.filePath(QStringLiteral("jackd.log")));
            log.open(QIODevice::ReadOnly);
            return QStringLiteral("the JACK server did not answer within 10 s: ") +
                   QString::fromLocal8Bit(log.readAll().right(400));
        }
        qputenv("JACK_DEFAULT_SERVER", name_.toLocal8Bit());
        return QString();
    }

  private:
    QString name_;
    QTemporaryDir log_;
    QProcess process_;
};

// The least input stream that serves: the server's capture ports, two channels, float.
class JackInput : public AudioInputDevice {
  public:
    bool start(AudioCaptureSink& sink) override {
        sink_ = &sink;
        try {
            audio_ = std::make_unique<RtAudio>(RtAudio::UNIX_JACK);
            audio_->showWarnings(false);
            RtAudio::StreamParameters input;
            input.deviceId = audio_->getDefaultInputDevice();
            input.nChannels = 2;
            unsigned int frames = 64;
            audio_->openStream(nullptr, &input, RTAUDIO_FLOAT32, kServerRate, &frames, &Callback,
                               this);
            format_ = {int(audio_->getStreamSampleRate()), int(frames), 2};
            audio_->startStream();
        } catch (const RtAudioError& error) {
            error_ = QString::fromStdString(error.getMessage());
            audio_.reset();
            return false;
        }
        return true;
    }
    void stop() override {
        if (!audio_) return;
        try {
            if (audio_->isStreamRunning()) audio_->stopStream();
            if (audio_->isStreamOpen()) audio_->closeStream();
        } catch (const RtAudioError&) {
        }
        audio_.reset();
    }
    bool isRunning() const override { return audio_ && audio_->isStreamRunning(); }
    AudioStreamFormat format() const override { return format_; }
    QString description() const override { return QStringLiteral("JACK input"); }
    QString errorText() const override { return error_; }

    std::int64_t framesHeard() const { return frames_.load(); }
    int overflows() const { return overflows_.load(); }

  private:
    static int Callback(void*, void* input, unsigned int frames, double, RtAudioStreamStatus status,
                        void* self) {
        auto* device = static_cast<JackInput*>(self);
        if (status & RTAUDIO_INPUT_OVERFLOW) device->overflows_.fetch_add(1);
        device->sink_->capture(static_cast<const float*>(input), int(frames), 2);
        device->frames_.fetch_add(frames);
        return 0;
    }

    std::unique_ptr<RtAudio> audio_;
    AudioCaptureSink* sink_ = nullptr;
    AudioStreamFormat format_{kServerRate, 64, 2};
    QString error_;
    std::atomic<std::int64_t> frames_{0};
    std::atomic<int> overflows_{0};
};

std::int64_t FramesInFile(const QString& path) {
    SF_INFO info{};
    SNDFILE* file = sf_open(path.toLocal8Bit().constData(), SFM_READ, &info);
    if (!file) return -1;
    sf_close(file);
    return info.frames;
}

void capture_lost_frames(benchmark::State& state) {
    JackServer server;
    if (const QString why = server.start(); !why.isEmpty()) {
        state.SkipWithError(qPrintable(QStringLiteral("no JACK server: ") + why));
        return;
    }
    QTemporaryDir folder;
    const QString path = folder.filePath(QStringLiteral("take.wav"));
    JackInput device;
    WaveRecorder recorder(device);
    for (auto _ : state) {
        if (!recorder.start(path, 2, kTakeRate)) {
            state.SkipWithError(qPrintable(recorder.errorText()));
            return;
        }
        const auto end = std::chrono::steady_clock::now() + kRecording;
        while (recorder.isRecording() && std::chrono::steady_clock::now() < end) {
            QCoreApplication::processEvents();
            QThread::msleep(50);
        }
        if (!recorder.isRecording()) {
            state.SkipWithError("the recording stopped by itself");
            return;
        }
        recorder.stop();
    }
    const std::int64_t heard = device.framesHeard();
    const std::int64_t written = FramesInFile(path);
    // Every frame the device heard is in the file, resampled, unless the queue dropped it.
    const std::int64_t expected = (heard * kTakeRate + kServerRate - 1) / kServerRate;
    state.counters["capture_lost_frames"] = double(recorder.lostFrames());
    state.counters["file_seconds"] = double(written) / kTakeRate;
    state.counters["device_overflows"] = device.overflows();
    if (std::llabs(written + recorder.lostFrames() - expected) > 2)
        state.SkipWithError("the file does not hold the frames the device recorded");
    else if (written < kTakeRate * 55)
        state.SkipWithError("the server delivered well under a minute of audio");
}
BENCHMARK(capture_lost_frames)->Iterations(1)->Unit(benchmark::kSecond);

}  // namespace
