#include "midi_fixture.h"

#include "components/settings/memory_settings_store.h"
#include "midi/startup_device_check.h"

namespace {

struct StartupDeviceCheckTest : MidiTest {
    MemorySettingsStore settings;
    int dialogsShown = 0;

    StartupMidiOutcome Run() {
        return RunStartupMidiCheck(setup, context, settings, prompts, [this] { ++dialogsShown; });
    }
    void Store(const char* key, const char* text) {
        settings.setValue(QStringLiteral("MIDI"), QLatin1String(key), QLatin1String(text));
    }
    QStringList MessageTexts() const {
        QStringList texts;
        for (const MessagePrompt& prompt : prompts.shownMessages) texts.append(prompt.text);
        return texts;
    }
};

}  // namespace

TEST_F(StartupDeviceCheckTest, StoredDevicesOpenWhenTheFingerprintMatches) {
    midiIn.setDeviceNames({QStringLiteral("Keys")});
    midiOut.setDeviceNames({QStringLiteral("Synth"), QStringLiteral("Drums")});
    Store("MIDI_Error_Check", "14");
    Store("MIDI_Input", "0");
    Store("MIDI_Output", "1 ");
    context.DefaultMidiChannel = 2;
    context.MidiMainVolume = 100;
    context.MidiDeviceNamesLength = 99;  // left from an earlier check

    EXPECT_EQ(Run(), StartupMidiOutcome::PortsOpened);
    EXPECT_EQ(context.MidiDeviceNamesLength, 14);
    EXPECT_TRUE(prompts.shownMessages.isEmpty());
    EXPECT_EQ(dialogsShown, 0);
    EXPECT_EQ(midiIn.deviceIndex(), 0);
    EXPECT_EQ(midiOut.deviceIndex(), 1);
    EXPECT_EQ(context.MidiOutDevice, 1);
    EXPECT_EQ(midiOut.sent, (std::vector<ShortMessage>{{178, 7, 100}}));
    EXPECT_TRUE(statusTexts.isEmpty());
}

TEST_F(StartupDeviceCheckTest, FirstRunOrChangedDevicesAskForTheSetupDialog) {
    midiIn.setDeviceNames({QStringLiteral("Keys")});
    midiOut.setDeviceNames({QStringLiteral("Synth")});

    EXPECT_EQ(Run(), StartupMidiOutcome::SetupDialogShown);
    ASSERT_EQ(prompts.shownMessages.size(), 1);
    const MessagePrompt& question = prompts.shownMessages.front();
    EXPECT_EQ(question.text, QStringLiteral("Please select your MIDI devices now..."));
    EXPECT_EQ(question.title, QStringLiteral("MIDI Settings change detected"));
    EXPECT_EQ(question.icon, PromptIcon::Information);
    EXPECT_EQ(dialogsShown, 1);
    EXPECT_FALSE(midiIn.isOpen());
    EXPECT_FALSE(midiOut.isOpen());
    EXPECT_TRUE(midiOut.sent.empty());

    // A device renamed since the choice was stored.
    Store("MIDI_Error_Check", "9");
    midiOut.setDeviceNames({QStringLiteral("Synth 2")});
    EXPECT_EQ(Run(), StartupMidiOutcome::SetupDialogShown);
    EXPECT_EQ(dialogsShown, 2);
}

// With no devices at all the missing stored value reads as 0 and matches the empty fingerprint.
TEST_F(StartupDeviceCheckTest, NoDevicesAreReportedAndBothOpensSayWhatIsMissing) {
    EXPECT_EQ(Run(), StartupMidiOutcome::PortsOpened);
    EXPECT_EQ(MessageTexts(), (QStringList{QStringLiteral("No MIDI In ports detected"),
                                           QStringLiteral("No MIDI Out ports detected")}));
    for (const MessagePrompt& prompt : prompts.shownMessages) {
        EXPECT_EQ(prompt.title, QStringLiteral("Orvelle Quindara"));
        EXPECT_EQ(prompt.icon, PromptIcon::Exclamation);
    }
    EXPECT_EQ(statusTexts, (QStringList{QStringLiteral("No avaliable Midi In Devices detected"),
                                        QStringLiteral("No avaliable Midi Out Devices detected")}));
    EXPECT_EQ(dialogsShown, 0);
}
