#pragma once

#include "components/audio/devices/audio_device.h"

#include <QString>
#include <QStringList>

// The sound systems a stream can go through. Automatic takes the first that is there: JACK when
// its server runs, then PulseAudio when its server answers, then ALSA.
enum class AudioApi { Automatic, Jack, Pulse, Alsa, None };

// The settings text: "JACK", "PulseAudio", "ALSA", "None"; anything else is Automatic ("").
AudioApi AudioApiFromText(const QString& text);
QString AudioApiText(AudioApi api);

// Automatic becomes the API to use now; the others stay as they are.
AudioApi ResolveAudioApi(AudioApi api);
// Why the API cannot be used now, or "" when its server is there. Asks without starting one.
QString AudioApiUnavailableReason(AudioApi api);

// The device names an API offers, for the audio setup dialog; empty when it offers none.
QStringList AudioOutputDeviceNames(AudioApi api);
QStringList AudioInputDeviceNames(AudioApi api);

// "JACK 48 kHz 5.3 ms": the API, the rate and one period's latency.
QString DescribeStream(AudioApi api, const AudioStreamFormat& format);
