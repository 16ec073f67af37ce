#include "components/audio/capture/wave_recorder.h"

namespace {

constexpr int kLowestRate = 4000;
constexpr int kHighestRate = 192000;
// How soon a device that went away is noticed.
constexpr int kDeviceWatchMs = 200;

}  // namespace

WaveRecorder::WaveRecorder(AudioInputDevice& device, QObject* parent)
    : QObject(parent), device_(device) {
    deviceWatch_.setInterval(kDeviceWatchMs);
    connect(&deviceWatch_, &QTimer::timeout, this, &WaveRecorder::checkDevice);
}

WaveRecorder::~WaveRecorder() {
    stop();
}

bool WaveRecorder::start(const QString& path, int channels, int sampleRate) {
    if (recording_) {
        errorText_ = QStringLiteral("Already recording.");
        return false;
    }
    if ((channels != 1 && channels != 2) || sampleRate < kLowestRate || sampleRate > kHighestRate) {
        errorText_ = QStringLiteral("Unsupported recording format: %1 channels at %2 Hz.")
                         .arg(channels)
                         .arg(sampleRate);
        return false;
    }
    sink_.configure(device_.format().sampleRate, sampleRate, channels);
    // The writer reports from its own thread; the recording ends on this one, unless the report
    // arrives only after that recording was stopped.
    const int take = ++takeCount_;
    auto onFailure = [this, take](const QString& reason) {
        QMetaObject::invokeMethod(
            this,
            [this, take, reason] {
                if (take == takeCount_) endByItself(reason);
            },
            Qt::QueuedConnection);
    };
    if (!writer_.start(path, channels, sampleRate, sink_.queue(), onFailure)) {
        errorText_ = writer_.errorText();
        return false;
    }
    if (!device_.start(sink_)) {
        errorText_ = device_.errorText();
        writer_.close();
        return false;
    }
    errorText_.clear();
    recording_ = true;
    deviceWatch_.start();
    return true;
}

void WaveRecorder::stop() {
    if (!recording_) return;
    recording_ = false;
    deviceWatch_.stop();
    device_.stop();
    sink_.finish();
    writer_.close();
}

qint64 WaveRecorder::recordedMilliseconds() const {
    return writer_.framesWritten() * 1000 / sink_.takeRate();
}

void WaveRecorder::endByItself(const QString& reason) {
    if (!recording_) return;
    stop();
    emit stoppedByItself(reason);
}

void WaveRecorder::checkDevice() {
    if (!recording_ || device_.isRunning()) return;
    const QString why = device_.errorText();
    endByItself(why.isEmpty() ? QStringLiteral("The recording device stopped.")
                              : QStringLiteral("The recording device stopped: %1").arg(why));
}
