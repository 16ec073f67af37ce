#include "components/audio/devices/rtaudio_stream.h"

#include <rtaudio/RtAudio.h>

#include <algorithm>
#include <utility>

namespace {

RtAudio::Api ToRtAudio(AudioApi api) {
    switch (api) {
        case AudioApi::Jack:
            return RtAudio::UNIX_JACK;
        case AudioApi::Pulse:
            return RtAudio::LINUX_PULSE;
        case AudioApi::Alsa:
            return RtAudio::LINUX_ALSA;
        case AudioApi::Automatic:
        case AudioApi::None:
            break;
    }
    return RtAudio::RTAUDIO_DUMMY;
}

int ChannelsOf(const RtAudio::DeviceInfo& info, RtAudioStream::Direction direction) {
    return static_cast<int>(direction == RtAudioStream::Direction::Output ? info.outputChannels
                                                                          : info.inputChannels);
}

// The device with that name, or the default one for an empty name; -1 when there is none.
int FindDevice(RtAudio& audio, RtAudioStream::Direction direction, const QString& name) {
    const unsigned int count = audio.getDeviceCount();
    if (name.isEmpty()) {
        const unsigned int preferred = direction == RtAudioStream::Direction::Output
                                           ? audio.getDefaultOutputDevice()
                                           : audio.getDefaultInputDevice();
        if (preferred < count && ChannelsOf(audio.getDeviceInfo(preferred), direction) > 0) {
            return static_cast<int>(preferred);
        }
    }
    const std::string wanted = name.toStdString();
    for (unsigned int device = 0; device < count; ++device) {
        const RtAudio::DeviceInfo info = audio.getDeviceInfo(device);
        if (ChannelsOf(info, direction) > 0 && (name.isEmpty() || info.name == wanted)) {
            return static_cast<int>(device);
        }
    }
    return -1;
}

// The device's own rate: JACK offers only the server's, PulseAudio its sink's or source's.
unsigned int ChooseRate(const RtAudio::DeviceInfo& info) {
    if (info.preferredSampleRate > 0) return info.preferredSampleRate;
    const auto& rates = info.sampleRates;
    if (std::find(rates.begin(), rates.end(), 48000u) != rates.end() || rates.empty()) return 48000;
    return rates.back();
}

}  // namespace

RtAudioStream::RtAudioStream(AudioApi api, QString deviceName, Direction direction, int channels,
                             int periodFrames)
    : api_(api),
      deviceName_(std::move(deviceName)),
      direction_(direction),
      channels_(channels),
      periodFrames_(periodFrames) {}

RtAudioStream::~RtAudioStream() {
    close();
}

bool RtAudioStream::Fail(const QString& reason) {
    error_ = reason;
    audio_.reset();
    running_ = false;
    return false;
}

bool RtAudioStream::open(Callback callback, void* user) {
    close();
    error_.clear();
    if (api_ == AudioApi::Automatic || api_ == AudioApi::None) {
        return Fail(QStringLiteral("no sound system chosen"));
    }
    // RtAudio would let libpulse or the ALSA plugins start a server; ask quietly first.
    if (const QString reason = AudioApiUnavailableReason(api_); !reason.isEmpty()) {
        return Fail(reason);
    }
    const bool output = direction_ == Direction::Output;
    try {
        audio_ = std::make_unique<RtAudio>(ToRtAudio(api_));
        audio_->showWarnings(false);
        if (audio_->getCurrentApi() != ToRtAudio(api_)) {
            return Fail(QStringLiteral("%1 is not built in").arg(AudioApiText(api_)));
        }
        const int device = FindDevice(*audio_, direction_, deviceName_);
        if (device < 0) {
            const QString what = output ? QStringLiteral("output") : QStringLiteral("input");
            return Fail(deviceName_.isEmpty()
                            ? QStringLiteral("%1 offers no %2 device").arg(AudioApiText(api_), what)
                            : QStringLiteral("no %1 device \"%2\"").arg(what, deviceName_));
        }
        const RtAudio::DeviceInfo info = audio_->getDeviceInfo(static_cast<unsigned int>(device));
        const int channels = std::min(channels_, ChannelsOf(info, direction_));
        if (channels < channels_ && output) {
            return Fail(QStringLiteral("\"%1\" is not a stereo device").arg(info.name.c_str()));
        }
        RtAudio::StreamParameters parameters;
        parameters.deviceId = static_cast<unsigned int>(device);
        parameters.nChannels = static_cast<unsigned int>(channels);
        RtAudio::StreamOptions options;
        // JACK names the client after the stream; PulseAudio shows it as the application.
        options.streamName = output ? "Orvelle Quindara Audio Out" : "Orvelle Quindara Audio In";
        unsigned int frames = static_cast<unsigned int>(periodFrames_);
        audio_->openStream(output ? &parameters : nullptr, output ? nullptr : &parameters,
                           RTAUDIO_FLOAT32, ChooseRate(info), &frames, callback, user, &options);
        if (!audio_->isStreamOpen()) return Fail(QStringLiteral("the stream did not open"));
        format_.sampleRate = static_cast<int>(audio_->getStreamSampleRate());
        format_.periodFrames = static_cast<int>(frames);
        format_.channels = channels;
        return true;
    } catch (const RtAudioError& error) {
        return Fail(QString::fromStdString(error.getMessage()));
    } catch (const std::exception& error) {
        return Fail(QString::fromLocal8Bit(error.what()));
    }
}

bool RtAudioStream::start() {
    if (!audio_) return false;
    if (running_) return true;
    try {
        audio_->startStream();
        running_ = audio_->isStreamRunning();
        if (!running_) return Fail(QStringLiteral("the stream did not start"));
        return true;
    } catch (const RtAudioError& error) {
        return Fail(QString::fromStdString(error.getMessage()));
    }
}

void RtAudioStream::close() {
    if (!audio_) return;
    try {
        if (audio_->isStreamRunning()) audio_->abortStream();
        if (audio_->isStreamOpen()) audio_->closeStream();
    } catch (const RtAudioError&) {
        // A server that went away leaves nothing to close.
    }
    audio_.reset();
    running_ = false;
}

QString RtAudioStream::description() const {
    return DescribeStream(api_, format_);
}

QStringList RtAudioDeviceNames(AudioApi api, RtAudioStream::Direction direction) {
    QStringList names;
    if (api == AudioApi::Automatic || api == AudioApi::None) return names;
    if (!AudioApiUnavailableReason(api).isEmpty()) return names;
    try {
        RtAudio audio(ToRtAudio(api));
        audio.showWarnings(false);
        if (audio.getCurrentApi() != ToRtAudio(api)) return names;
        const unsigned int count = audio.getDeviceCount();
        for (unsigned int device = 0; device < count; ++device) {
            const RtAudio::DeviceInfo info = audio.getDeviceInfo(device);
            if (ChannelsOf(info, direction) > 0) names << QString::fromStdString(info.name);
        }
    } catch (const RtAudioError&) {
        // A server that went away mid-way offers what was found so far.
    }
    return names;
}
