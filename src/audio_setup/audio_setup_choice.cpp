#include "audio_setup/audio_setup_choice.h"

#include <algorithm>

QString AudioApiChoiceName(AudioApi api) {
    return api == AudioApi::Automatic ? QStringLiteral("Automatic") : AudioApiText(api);
}

QString AudioApiNote(AudioApi api) {
    if (api == AudioApi::Automatic) {
        return QStringLiteral("Uses %1 now").arg(AudioApiText(ResolveAudioApi(api)));
    }
    return AudioApiUnavailableReason(api);
}

QString PeriodLatencyText(int periodFrames, int sampleRate) {
    const double milliseconds = 1000.0 * periodFrames / std::max(sampleRate, 1);
    return QStringLiteral("%1 ms").arg(milliseconds, 0, 'f', 1);
}

void StoreAudioDeviceSettings(const AudioDeviceSettings& choice, SettingsStore& store) {
    store.setValue(kAudioSettingsGroup, QStringLiteral("Api"), AudioApiText(choice.api));
    store.setValue(kAudioSettingsGroup, QStringLiteral("OutputDevice"), choice.outputDevice);
    store.setValue(kAudioSettingsGroup, QStringLiteral("InputDevice"), choice.inputDevice);
    store.setValue(kAudioSettingsGroup, QStringLiteral("PeriodFrames"),
                   QString::number(choice.periodFrames));
}
