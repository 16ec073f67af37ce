#pragma once

#include "components/audio/devices/audio_device_settings.h"

#include <QString>

#include <array>

// What the audio setup dialog offers, in the order it lists them.
inline constexpr std::array kAudioApiChoices{AudioApi::Automatic, AudioApi::Jack, AudioApi::Pulse,
                                             AudioApi::Alsa, AudioApi::None};
inline constexpr std::array kPeriodFrameChoices{64, 128, 256, 512, 1024, 2048};

// The name the dialog shows: the settings text, and "Automatic" for the first that is there.
QString AudioApiChoiceName(AudioApi api);
// Why the API will not play now ("no JACK server runs"), or which one Automatic picks now.
QString AudioApiNote(AudioApi api);

// One period's latency: "5.3 ms" for 256 frames at 48 kHz.
QString PeriodLatencyText(int periodFrames, int sampleRate);

// The counterpart of AudioDeviceSettings::Read: every value in the group "Audio" as text.
void StoreAudioDeviceSettings(const AudioDeviceSettings& choice, SettingsStore& store);
