#include "components/audio/devices/audio_device_settings.h"

#include "base/text_values.h"
#include "components/audio/devices/null_audio_device.h"
#include "components/audio/devices/rtaudio_input_device.h"
#include "components/audio/devices/rtaudio_output_device.h"

#include <algorithm>

AudioDeviceSettings AudioDeviceSettings::Read(const SettingsStore& store) {
    AudioDeviceSettings settings;
    settings.api = AudioApiFromText(store.value(kAudioSettingsGroup, QStringLiteral("Api")));
    settings.outputDevice = store.value(kAudioSettingsGroup, QStringLiteral("OutputDevice"));
    settings.inputDevice = store.value(kAudioSettingsGroup, QStringLiteral("InputDevice"));
    const int frames = LenientNumber(
        store.value(kAudioSettingsGroup, QStringLiteral("PeriodFrames"), QStringLiteral("256")));
    settings.periodFrames = frames > 0 ? std::clamp(frames, 16, 8192) : 256;
    return settings;
}

std::unique_ptr<AudioOutputDevice> OpenOutputDevice(const AudioDeviceSettings& settings,
                                                    QString& failure) {
    const AudioApi api = ResolveAudioApi(settings.api);
    if (api == AudioApi::None) {
        return std::make_unique<NullOutputDevice>(
            AudioStreamFormat{48000, settings.periodFrames, 2});
    }
    auto device =
        std::make_unique<RtAudioOutputDevice>(api, settings.outputDevice, settings.periodFrames);
    if (device->open()) return device;
    failure = device->errorText();
    return nullptr;
}

std::unique_ptr<AudioInputDevice> OpenInputDevice(const AudioDeviceSettings& settings, int channels,
                                                  int nullRate, QString& failure) {
    const AudioApi api = ResolveAudioApi(settings.api);
    if (api == AudioApi::None) {
        return std::make_unique<NullInputDevice>(
            AudioStreamFormat{nullRate, settings.periodFrames, channels});
    }
    auto device = std::make_unique<RtAudioInputDevice>(api, settings.inputDevice, channels,
                                                       settings.periodFrames);
    if (device->open()) return device;
    failure = device->errorText();
    return nullptr;
}
