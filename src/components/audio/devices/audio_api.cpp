#include "components/audio/devices/audio_api.h"

#include "components/audio/devices/rtaudio_stream.h"
#include "components/servers/jack_probe.h"
#include "components/servers/pulse_probe.h"

#include <algorithm>

AudioApi AudioApiFromText(const QString& text) {
    const QString name = text.trimmed();
    if (name.compare(QLatin1String("JACK"), Qt::CaseInsensitive) == 0) return AudioApi::Jack;
    if (name.compare(QLatin1String("PulseAudio"), Qt::CaseInsensitive) == 0) {
        return AudioApi::Pulse;
    }
    if (name.compare(QLatin1String("ALSA"), Qt::CaseInsensitive) == 0) return AudioApi::Alsa;
    if (name.compare(QLatin1String("None"), Qt::CaseInsensitive) == 0) return AudioApi::None;
    return AudioApi::Automatic;
}

QString AudioApiText(AudioApi api) {
    switch (api) {
        case AudioApi::Jack:
            return QStringLiteral("JACK");
        case AudioApi::Pulse:
            return QStringLiteral("PulseAudio");
        case AudioApi::Alsa:
            return QStringLiteral("ALSA");
        case AudioApi::None:
            return QStringLiteral("None");
        case AudioApi::Automatic:
            break;
    }
    return QString();
}

QString AudioApiUnavailableReason(AudioApi api) {
    if (api == AudioApi::Jack && !JackServerRunning()) return QStringLiteral("no JACK server runs");
    if (api == AudioApi::Pulse && !PulseServerAnswers()) {
        return QStringLiteral("no PulseAudio server answers");
    }
    return QString();
}

AudioApi ResolveAudioApi(AudioApi api) {
    if (api != AudioApi::Automatic) return api;
    if (JackServerRunning()) return AudioApi::Jack;
    if (PulseServerAnswers()) return AudioApi::Pulse;
    return AudioApi::Alsa;
}

QStringList AudioOutputDeviceNames(AudioApi api) {
    return RtAudioDeviceNames(api, RtAudioStream::Direction::Output);
}

QStringList AudioInputDeviceNames(AudioApi api) {
    return RtAudioDeviceNames(api, RtAudioStream::Direction::Input);
}

QString DescribeStream(AudioApi api, const AudioStreamFormat& format) {
    const double kilohertz = format.sampleRate / 1000.0;
    const double milliseconds = 1000.0 * format.periodFrames / std::max(format.sampleRate, 1);
    return QStringLiteral("%1 %2 kHz %3 ms")
        .arg(AudioApiText(api), QString::number(kilohertz, 'g', 4),
             QString::number(milliseconds, 'f', 1));
}
