#include "midi_fixture.h"

using MidiSetupTest = MidiTest;

namespace {

const QString kNoIn = QStringLiteral("No avaliable Midi In Devices detected");
const QString kNoOut = QStringLiteral("No avaliable Midi Out Devices detected");

}  // namespace

TEST_F(MidiSetupTest, AllNotesOffSweepsEveryChannelThenRaisesThePadKeys) {
    midiOut.setDeviceNames({QStringLiteral("Synth")});
    ASSERT_TRUE(midiOut.open(0));
    setup.AllMidiNotesOff();

    ASSERT_EQ(midiOut.sent.size(), 2048u);
    for (std::size_t i = 0; i < midiOut.sent.size(); ++i) {
        const ShortMessage expected{static_cast<std::uint8_t>(144 + i / 128),
                                    static_cast<std::uint8_t>(i % 128), 0};
        ASSERT_EQ(midiOut.sent[i], expected) << "message " << i;
    }
    ASSERT_EQ(keys.size(), 16u);
    for (int i = 0; i < 16; ++i) EXPECT_EQ(keys[i], (KeyShown{57 + i, false}));
}

TEST_F(MidiSetupTest, MainVolumeGoesToTheDefaultChannelAndStaysAController) {
    midiOut.setDeviceNames({QStringLiteral("Synth")});
    ASSERT_TRUE(midiOut.open(0));
    context.DefaultMidiChannel = 2;
    context.MidiMainVolume = 100;
    setup.SetMidiMainVolume();
    EXPECT_EQ(midiOut.sent, (std::vector<ShortMessage>{{178, 7, 100}}));

    // Corrupt settings: the value is kept a data byte, a channel past 15 sends nothing rather
    // than a program change.
    midiOut.sent.clear();
    context.MidiMainVolume = 300;
    setup.SetMidiMainVolume();
    context.MidiMainVolume = -5;
    setup.SetMidiMainVolume();
    context.DefaultMidiChannel = 20;
    setup.SetMidiMainVolume();
    context.DefaultMidiChannel = -1;
    setup.SetMidiMainVolume();
    EXPECT_EQ(midiOut.sent, (std::vector<ShortMessage>{{178, 7, 127}, {178, 7, 0}}));
}

TEST_F(MidiSetupTest, FingerprintAddsInThenOutNameLengthsWithoutResetting) {
    midiIn.setDeviceNames({QStringLiteral("Keys")});
    midiOut.setDeviceNames({QStringLiteral("Synth"), QStringLiteral("Drums")});
    setup.CheckMidiDevices();
    EXPECT_TRUE(context.MidiInAvailable);
    EXPECT_TRUE(context.MidiOutAvailable);

    context.MidiDeviceNamesLength = 0;
    setup.VerifyMidiDevices();
    EXPECT_EQ(context.MidiDeviceNamesLength, 14);
    setup.VerifyMidiDevices();
    EXPECT_EQ(context.MidiDeviceNamesLength, 28);
}

TEST_F(MidiSetupTest, ReopeningAnOpenPortMovesItToTheNewDevice) {
    midiIn.setDeviceNames({QStringLiteral("Keys A"), QStringLiteral("Keys B")});
    midiOut.setDeviceNames({QStringLiteral("Synth A"), QStringLiteral("Synth B")});
    setup.OpenMidiInPort();
    setup.OpenMidiOutPort();
    context.MidiInDevice = 1;
    context.MidiOutDevice = 1;
    setup.OpenMidiInPort();
    setup.OpenMidiOutPort();
    EXPECT_TRUE(statusTexts.isEmpty());
    EXPECT_EQ(midiIn.deviceIndex(), 1);
    EXPECT_EQ(midiOut.deviceIndex(), 1);
}

// A device index stored on an earlier run may name a device that is gone: the port stays
// closed, the status bar says the device is missing, and sending simply goes nowhere.
TEST_F(MidiSetupTest, StaleDeviceIndexFailsTheOpenAndTheProgramRunsOn) {
    midiIn.setDeviceNames({QStringLiteral("Keys")});
    midiOut.setDeviceNames({QStringLiteral("Synth")});
    context.MidiInDevice = 3;
    context.MidiOutDevice = -2;
    setup.OpenMidiInPort();
    setup.OpenMidiOutPort();
    EXPECT_EQ(statusTexts, (QStringList{kNoIn, kNoOut}));
    EXPECT_FALSE(midiIn.isOpen());
    EXPECT_FALSE(midiOut.isOpen());

    setup.SetMidiMainVolume();
    setup.AllMidiNotesOff();
    EXPECT_TRUE(midiOut.sent.empty());

    // Once the user picks an existing device it opens as usual, and the notice goes.
    context.MidiOutDevice = 0;
    setup.OpenMidiOutPort();
    EXPECT_TRUE(midiOut.isOpen());
    EXPECT_EQ(statusTexts, (QStringList{kNoIn, kNoOut, ""}));
}
