#pragma once

#include "components/audio/devices/audio_api.h"
#include "components/audio/devices/audio_device.h"
#include "components/settings/settings_store.h"

#include <QString>

#include <memory>

inline const QString kAudioSettingsGroup = QStringLiteral("Audio");

// The sound devices the user chose, settings group "Audio": "Api" ("JACK", "PulseAudio",
// "ALSA", "None", or "" for the first that is there), "OutputDevice" and "InputDevice" (device
// names, "" for the default one) and "PeriodFrames" (default 256).
struct AudioDeviceSettings {
    AudioApi api = AudioApi::Automatic;
    QString outputDevice;
    QString inputDevice;
    int periodFrames = 256;

    static AudioDeviceSettings Read(const SettingsStore& store);
};

// The chosen output device, open and ready to start; the null device when the user wants none.
// Null, with the reason in `failure`, when it cannot be opened.
std::unique_ptr<AudioOutputDevice> OpenOutputDevice(const AudioDeviceSettings& settings,
                                                    QString& failure);
// The same for recording, `channels` 1 or 2; the null input records at `nullRate`.
std::unique_ptr<AudioInputDevice> OpenInputDevice(const AudioDeviceSettings& settings, int channels,
                                                  int nullRate, QString& failure);
