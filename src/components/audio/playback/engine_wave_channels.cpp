#include "components/audio/playback/engine_wave_channels.h"

#include "base/pads.h"

#include <algorithm>
#include <utility>

namespace {

// A file this small decodes at a press in a few milliseconds at most, sooner than a trip to the
// worker and back, so the pad still sounds in the very next period.
constexpr qint64 kDecodeAtPressBytes = 256 * 1024;

const QString kFileMissing = QStringLiteral("the file does not exist");

}  // namespace

MixerWaveChannel::MixerWaveChannel(EngineWaveChannels& owner, int voice)
    : owner_(owner), mixer_(owner.mixer_), cache_(owner.cache_), voice_(voice) {}

bool MixerWaveChannel::setFileName(const QString& path) {
    // A new file replaces whatever sounds now.
    if (playing_) stop();
    CancelDecode();
    if (path.isEmpty()) {
        Take(QString(), nullptr);
        return true;
    }
    LoadedSamples loaded = cache_.load(path);
    if (!loaded.buffer) {
        Fail(loaded.error);
        return false;
    }
    Take(path, std::move(loaded.buffer));
    return true;
}

bool MixerWaveChannel::load(const QString& path) {
    if (playing_) stop();
    CancelDecode();
    if (path.isEmpty()) return setFileName(path);
    const QFileInfo info(path);
    if (!info.isFile()) {
        cache_.forget(path);
        Fail(kFileMissing);
        return false;
    }
    if (auto buffer = cache_.find(path, info)) {
        Take(path, std::move(buffer));
    } else {
        StartDecode(path, info);
    }
    return true;
}

FileReadiness MixerWaveChannel::prepare(const QString& path) {
    if (playing_) stop();
    if (decoding_ && path == fileName_) return FileReadiness::Decoding;
    const QFileInfo info(path);
    if (!path.isEmpty() && info.isFile() && info.size() > kDecodeAtPressBytes) {
        // Decoded already and unchanged on disk, or else off to the worker.
        if (auto buffer = cache_.find(path, info)) {
            CancelDecode();
            Take(path, std::move(buffer));
            return FileReadiness::Ready;
        }
        CancelDecode();
        StartDecode(path, info);
        return FileReadiness::Decoding;
    }
    return setFileName(path) ? FileReadiness::Ready : FileReadiness::Failed;
}

void MixerWaveChannel::Take(const QString& path, std::shared_ptr<const SampleBuffer> buffer) {
    buffer_ = std::move(buffer);
    fileName_ = path;
    lastError_.clear();
}

void MixerWaveChannel::Fail(const QString& error) {
    buffer_.reset();
    fileName_.clear();
    lastError_ = error;
}

void MixerWaveChannel::StartDecode(const QString& path, const QFileInfo& info) {
    Take(path, nullptr);
    decoding_ = true;
    const quint64 decode = ++latestDecode_;
    const SampleCache::Stamp stamp = SampleCache::StampOf(info);
    owner_.DecodeBegins(voice_);
    JobCallbacks<LoadedSamples> callbacks;
    callbacks.done = [this, decode, path, stamp](LoadedSamples loaded) {
        Decoded(decode, path, stamp, std::move(loaded));
    };
    callbacks.failed = [this, decode, path, stamp](const QString& error) {
        Decoded(decode, path, stamp, LoadedSamples{nullptr, error});
    };
    callbacks.progress = [this, decode](int percent) {
        if (decode == latestDecode_ && decoding_) owner_.DecodeAdvanced(voice_, percent);
    };
    decode_ = owner_.jobs_.run<LoadedSamples>(
        &owner_,
        [path](JobControl& control) {
            return LoadSampleFile(path, [&control](int percent) {
                control.reportProgress(percent);
                return !control.isCanceled();
            });
        },
        std::move(callbacks));
}

void MixerWaveChannel::CancelDecode() {
    if (!decoding_) return;
    decode_.cancel();
    decode_ = Job();
    decoding_ = false;
    startWhenDecoded_ = false;
    ++latestDecode_;
    owner_.DecodeEnds(voice_);
}

void MixerWaveChannel::Decoded(quint64 decode, const QString& path, const SampleCache::Stamp& stamp,
                               LoadedSamples loaded) {
    if (decode != latestDecode_ || !decoding_) return;
    decoding_ = false;
    decode_ = Job();
    const bool startNow = std::exchange(startWhenDecoded_, false);
    owner_.DecodeEnds(voice_);
    if (!loaded.buffer) {
        cache_.forget(path);
        Fail(loaded.error);
        playing_ = false;
        owner_.Loaded(voice_, false, lastError_);
        return;
    }
    cache_.remember(path, loaded.buffer, stamp);
    Take(path, std::move(loaded.buffer));
    if (startNow) mixer_.start(voice_, buffer_);
    owner_.Loaded(voice_, true, QString());
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
    if (decoding_) {
        startWhenDecoded_ = true;
        playing_ = true;
        return true;
    }
    if (!buffer_) {
        lastError_ = QStringLiteral("no sound is loaded");
        return false;
    }
    mixer_.start(voice_, buffer_);
    playing_ = true;
    return true;
}

void MixerWaveChannel::stop() {
    startWhenDecoded_ = false;
    mixer_.stop(voice_);
    playing_ = false;
}

void MixerWaveChannel::close() {
    stop();
    CancelDecode();
    buffer_.reset();
    fileName_.clear();
}

void MixerWaveChannel::playbackEnded() {
    playing_ = false;
    startWhenDecoded_ = false;
}

EngineWaveChannels::EngineWaveChannels(WaveMixer& mixer, QObject* parent)
    : WaveChannels(parent), mixer_(mixer) {
    for (int voice = 0; voice < WaveMixer::kVoices; ++voice) {
        channels_[voice] = std::make_unique<MixerWaveChannel>(*this, voice);
    }
    decodePercent_.fill(-1);
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

void EngineWaveChannels::Loaded(int voice, bool ok, const QString& error) {
    if (voice != WaveMixer::kPlayerVoice) emit loaded(kFirstPad + voice, ok, error);
}

void EngineWaveChannels::DecodeBegins(int voice) {
    if (batchBegun_ == batchEnded_) batchClock_.start();
    ++batchBegun_;
    decodePercent_[voice] = 0;
}

void EngineWaveChannels::DecodeAdvanced(int voice, int percent) {
    decodePercent_[voice] = percent;
    ReportProgress();
}

void EngineWaveChannels::DecodeEnds(int voice) {
    decodePercent_[voice] = -1;
    ++batchEnded_;
    ReportProgress();
}

// The decodes begun since none was under way count as one task: the ended ones whole, the
// running ones as far as they have come.
void EngineWaveChannels::ReportProgress() {
    if (batchEnded_ == batchBegun_) {
        batchBegun_ = batchEnded_ = 0;
        if (std::exchange(progressShown_, false)) emit loadProgress(100);
        return;
    }
    if (!progressShown_ && batchClock_.elapsed() < kMomentMilliseconds) return;
    progressShown_ = true;
    int percents = batchEnded_ * 100;
    for (int percent : decodePercent_) percents += std::max(percent, 0);
    emit loadProgress(std::min(percents / batchBegun_, 99));
}
