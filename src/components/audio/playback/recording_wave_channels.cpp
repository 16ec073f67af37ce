#include "components/audio/playback/recording_wave_channels.h"

#include "base/pads.h"

void RecordingWaveChannel::record(const QString& what) {
    log_.append(QString::number(note_) + u' ' + what);
}

bool RecordingWaveChannel::setFileName(const QString& path) {
    record(QStringLiteral("file ") + path);
    if (!path.isEmpty() && unloadableFiles.contains(path)) {
        fileName_.clear();
        lastError_ = QStringLiteral("cannot open %1").arg(path);
        return false;
    }
    playing_ = false;
    fileName_ = path;
    lastError_.clear();
    return true;
}

void RecordingWaveChannel::setFrequency(int hertz) {
    frequency = hertz;
    record(QStringLiteral("frequency %1").arg(hertz));
}

void RecordingWaveChannel::setLooping(bool value) {
    looping = value;
    record(QStringLiteral("looping %1").arg(value ? "on" : "off"));
}

void RecordingWaveChannel::setVolume(int value) {
    volume = value;
    record(QStringLiteral("volume %1").arg(value));
}

void RecordingWaveChannel::setPan(int value) {
    pan = value;
    record(QStringLiteral("pan %1").arg(value));
}

bool RecordingWaveChannel::start() {
    record(QStringLiteral("start"));
    if (failStart || fileName_.isEmpty()) return false;
    playing_ = true;
    return true;
}

void RecordingWaveChannel::stop() {
    record(QStringLiteral("stop"));
    playing_ = false;
}

void RecordingWaveChannel::close() {
    record(QStringLiteral("close"));
    playing_ = false;
    fileName_.clear();
}

RecordingWaveChannels::RecordingWaveChannels(QObject* parent) : WaveChannels(parent) {
    for (int note = kFirstPad; note <= kLastPad; ++note) {
        channels_[note - kFirstPad] = std::make_unique<RecordingWaveChannel>(note, log);
    }
}

RecordingWaveChannel& RecordingWaveChannels::channel(int padNote) {
    Q_ASSERT(IsPad(padNote));
    return *channels_[padNote - kFirstPad];
}

void RecordingWaveChannels::endPlayback(int padNote) {
    channel(padNote).finishPlayback();
    emit playbackEnded(padNote);
}
