#include "midi_fixture.h"

#include "components/settings/memory_settings_store.h"
#include "midi/startup_device_check.h"

// The first run and stored devices that still match are driven through the whole program in
// tests/app; here the devices that changed or are missing.
namespace {

struct StartupDeviceCheckTest : MidiTest {
    MemorySettingsStore settings;
    int dialogsShown = 0;

    StartupMidiOutcome Run() {
        return RunStartupMidiCheck(setup, context, settings, prompts, [this] { ++dialogsShown; });
    }
    QStringList MessageTexts() const {
        QStringList texts;
        for (const MessagePrompt& prompt : prompts.shownMessages) texts.append(prompt.text);
        return texts;
    }
};

}  // namespace

TEST_F(StartupDeviceCheckTest, ADeviceRenamedSinceTheChoiceWasStoredAsksForTheSetupDialog) {
    midiIn.setDeviceNames({QStringLiteral("Keys")});
    midiOut.setDeviceNames({QStringLiteral("Synth 2")});
    settings.setValue("MIDI", "MIDI_Error_Check", "9");  // "Keys" and "Synth"
    EXPECT_EQ(Run(), StartupMidiOutcome::SetupDialogShown);
    EXPECT_EQ(MessageTexts(), QStringList({"Please select your MIDI devices now..."}));
    EXPECT_EQ(dialogsShown, 1);
    EXPECT_FALSE(midiIn.isOpen());
    EXPECT_FALSE(midiOut.isOpen());
}

// With no devices at all the missing stored value reads as 0 and matches the empty fingerprint.
TEST_F(StartupDeviceCheckTest, NoDevicesAreReportedAndBothOpensSayWhatIsMissing) {
    EXPECT_EQ(Run(), StartupMidiOutcome::PortsOpened);
    EXPECT_EQ(MessageTexts(), (QStringList{QStringLiteral("No MIDI In ports detected"),
                                           QStringLiteral("No MIDI Out ports detected")}));
    EXPECT_EQ(statusTexts, (QStringList{QStringLiteral("No avaliable Midi In Devices detected"),
                                        QStringLiteral("No avaliable Midi Out Devices detected")}));
    EXPECT_EQ(dialogsShown, 0);
}
