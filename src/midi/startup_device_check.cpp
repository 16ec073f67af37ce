#include "midi/startup_device_check.h"

#include "base/text_values.h"
#include "components/prompts/prompts.h"
#include "components/settings/settings_store.h"
#include "engine/note_slots.h"
#include "midi/midi_setup.h"

namespace {

const QString kMidiSection = QStringLiteral("MIDI");

int StoredNumber(const SettingsStore& settings, const QString& key) {
    return LenientNumber(settings.value(kMidiSection, key));
}

}  // namespace

StartupMidiOutcome RunStartupMidiCheck(MidiSetup& midiSetup, Context& context,
                                       const SettingsStore& settings, Prompts& prompts,
                                       const std::function<void()>& showMidiSetupDialog) {
    // The devices of the system chosen, so the fingerprint compares like with like.
    midiSetup.UseMidiSystem(MidiSystemFromText(settings.value(kMidiSection, kMidiSystemKey)));
    midiSetup.CheckMidiDevices();
    context.MidiDeviceNamesLength = 0;
    midiSetup.VerifyMidiDevices();

    if (!context.MidiInAvailable) {
        prompts.message(
            Notice(QStringLiteral("No MIDI In ports detected"), PromptIcon::Exclamation));
    }
    if (!context.MidiOutAvailable) {
        prompts.message(
            Notice(QStringLiteral("No MIDI Out ports detected"), PromptIcon::Exclamation));
    }

    // A missing value reads as 0, so a machine without any device never asks.
    if (StoredNumber(settings, QStringLiteral("MIDI_Error_Check")) ==
        context.MidiDeviceNamesLength) {
        context.MidiInDevice = StoredNumber(settings, QStringLiteral("MIDI_Input"));
        midiSetup.OpenMidiInPort();
        context.MidiOutDevice = StoredNumber(settings, QStringLiteral("MIDI_Output"));
        midiSetup.OpenMidiOutPort();
        midiSetup.SetMidiMainVolume();
        return StartupMidiOutcome::PortsOpened;
    }

    prompts.message(MessagePrompt{QStringLiteral("MIDI Settings change detected"),
                                  QStringLiteral("Please select your MIDI devices now..."),
                                  PromptIcon::Information,
                                  {PromptButton::Ok},
                                  PromptButton::Ok});
    if (showMidiSetupDialog) showMidiSetupDialog();
    return StartupMidiOutcome::SetupDialogShown;
}
