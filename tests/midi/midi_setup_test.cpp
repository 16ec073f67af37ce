#include "midi_fixture.h"

using MidiSetupTest = MidiTest;

TEST_F(MidiSetupTest, AllNotesOffSweepsEveryChannelThenRaisesThePadKeys) {
    midiOut.setDeviceNames({QStringLiteral("Synth")});
    ASSERT_TRUE(midiOut.open(0));
    setup.AllMidiNotesOff();

    std::vector<ShortMessage> offs;
    for (int i = 0; i < 16 * 128; ++i)
        offs.push_back({std::uint8_t(144 + i / 128), std::uint8_t(i % 128), 0});
    EXPECT_EQ(midiOut.sent, offs);
    std::vector<KeyShown> raised;
    for (int note = 57; note <= 72; ++note) raised.push_back({note, false});
    EXPECT_EQ(keys, raised);
}

// Corrupt settings: the value is kept a data byte, a channel past 15 sends nothing rather than
// a program change.
TEST_F(MidiSetupTest, MainVolumeGoesToTheDefaultChannelAndStaysAController) {
    midiOut.setDeviceNames({QStringLiteral("Synth")});
    ASSERT_TRUE(midiOut.open(0));
    const struct {
        int channel;
        int volume;
    } stored[] = {{2, 100}, {2, 300}, {2, -5}, {20, 100}, {-1, 100}};
    for (const auto& [channel, volume] : stored) {
        context.DefaultMidiChannel = channel;
        context.MidiMainVolume = volume;
        setup.SetMidiMainVolume();
    }
    EXPECT_EQ(midiOut.sent, (std::vector<ShortMessage>{{178, 7, 100}, {178, 7, 127}, {178, 7, 0}}));
}

// A device index stored on an earlier run may name a device that is gone: the port stays
// closed, the status bar says the device is missing, and sending simply goes nowhere.
TEST_F(MidiSetupTest, AStaleDeviceIndexLeavesThePortClosedAndAnOpenPortMovesOnReopening) {
    const QString noIn = QStringLiteral("No avaliable Midi In Devices detected");
    const QString noOut = QStringLiteral("No avaliable Midi Out Devices detected");
    midiIn.setDeviceNames({QStringLiteral("Keys A"), QStringLiteral("Keys B")});
    midiOut.setDeviceNames({QStringLiteral("Synth A"), QStringLiteral("Synth B")});
    context.MidiInDevice = 3;
    context.MidiOutDevice = -2;
    setup.OpenMidiInPort();
    setup.OpenMidiOutPort();
    EXPECT_EQ(statusTexts, (QStringList{noIn, noOut}));
    EXPECT_FALSE(midiIn.isOpen() || midiOut.isOpen());
    setup.SetMidiMainVolume();
    setup.AllMidiNotesOff();
    EXPECT_TRUE(midiOut.sent.empty());

    // Once the user picks an existing device it opens and the notice goes; another one moves it.
    for (int device : {0, 1}) {
        context.MidiInDevice = context.MidiOutDevice = device;
        setup.OpenMidiInPort();
        setup.OpenMidiOutPort();
    }
    EXPECT_EQ(statusTexts, (QStringList{noIn, noOut, ""}));
    EXPECT_EQ(midiIn.deviceIndex(), 1);
    EXPECT_EQ(midiOut.deviceIndex(), 1);
}
