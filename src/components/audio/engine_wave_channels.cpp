#include "components/audio/engine_wave_channels.h"

#include "engine/note_slots.h"

#include <algorithm>

bool MixerWaveChannel::setFileName(const QString& path) {
    // A new file replaces whatever sounds now.
    if (playing_) stop();
    if (path.isEmpty()) {
        buffer_.reset();
        fileName_.clear();
        lastError_.clear();
        return true;
    }
    LoadedSamples loaded = cache_.load(path);
    if (!loaded.buffer) {
        buffer_.reset();
        fileName_.clear();
        lastError_ = loaded.error;
        return false;
    }
    buffer_ = std::move(loaded.buffer);
    fileName_ = path;
    lastError_.clear();
    return true;
}

void MixerWaveChannel::setFrequency(int hertz) {
    mixer_.setRate(voice_, hertz <= 0 ? 0 : std::clamp(hertz, 100, 100000));
}

void MixerWaveChannel::setLooping(bool looping) {
    mixer_.setLooping(voice_, looping);
}

void MixerWaveChannel::setVolume(int volume) {
    volume_ = volume;
    mixer_.setVolumeAndPan(voice_, volume_, pan_);
}

void MixerWaveChannel::setPan(int pan) {
    pan_ = pan;
    mixer_.setVolumeAndPan(voice_, volume_, pan_);
}

bool MixerWaveChannel::start() {
    if (!buffer_) {
        lastError_ = QStringLiteral("no sound is loaded");
        return false;
    }
    mixer_.start(voice_, buffer_);
    playing_ = true;
    return true;
}

void MixerWaveChannel::stop() {
    mixer_.stop(voice_);
    playing_ = false;
}

void MixerWaveChannel::close() {
    stop();
    buffer_.reset();
    fileName_.clear();
}

EngineWaveChannels::EngineWaveChannels(WaveMixer& mixer, QObject* parent)
    : WaveChannels(parent), mixer_(mixer) {
    for (int voice = 0; voice < WaveMixer::kVoices; ++voice) {
        channels_[voice] = std::make_unique<MixerWaveChannel>(mixer_, cache_, voice);
    }
    timer_.setTimerType(Qt::PreciseTimer);
    connect(&timer_, &QTimer::timeout, this, &EngineWaveChannels::collectEvents);
    timer_.start(5);
}

MixerWaveChannel& EngineWaveChannels::channel(int padNote) {
    Q_ASSERT(IsPad(padNote));
    return *channels_[padNote - kFirstPad];
}

void EngineWaveChannels::collectEvents() {
    mixer_.collectEvents([this](int voice) { Ended(voice); });
}

void EngineWaveChannels::soundsCutOff() {
    for (int voice = 0; voice < WaveMixer::kVoices; ++voice) {
        if (channels_[voice]->isPlaying()) Ended(voice);
    }
}

void EngineWaveChannels::Ended(int voice) {
    channels_[voice]->playbackEnded();
    if (voice == WaveMixer::kPlayerVoice) {
        emit playerEnded();
    } else {
        emit playbackEnded(kFirstPad + voice);
    }
}
