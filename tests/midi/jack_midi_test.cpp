#include "jack_peer.h"
#include "midi_fixture.h"

#include "components/midi/rtmidi_client.h"
#include "components/midi/rtmidi_input_port.h"
#include "components/midi/rtmidi_output_port.h"
#include "midi/midi_input_pump.h"

#include <QTest>

namespace {

// The program's real RtMidi ports on a running JACK server, with peers standing in for the
// keyboard and the sound module.
struct JackMidiTest : MidiTest {
    void SetUp() override {
        REQUIRE_JACK_SERVER();
        MakeMidiSlot(60);
        MakeHeldWavePad(64);
    }
};

}  // namespace

TEST_F(JackMidiTest, SlotMessagesLeaveThroughTheMidiOutPort) {
    JackPeer soundModule;
    RtMidiOutputPort jackOut;
    const int device = jackOut.deviceNames().indexOf(soundModule.listeningPort());
    ASSERT_GE(device, 0) << jackOut.deviceNames().join(", ").toStdString();
    ASSERT_TRUE(jackOut.open(device)) << jackOut.errorText().toStdString();

    InputDispatcher jackDispatcher{context, jackOut, waves};
    jackDispatcher.ProcessInputData(144, 60, 100);
    jackDispatcher.ProcessInputData(128, 60, 0);

    std::vector<ShortMessage> expected = kSlotNoteOn;
    expected.push_back(kSlotNoteOff);
    EXPECT_TRUE(QTest::qWaitFor([&] { return soundModule.received().size() >= expected.size(); }));
    EXPECT_EQ(soundModule.received(), expected);
}

TEST_F(JackMidiTest, MessagesIntoTheMidiInPortArePumpedToTheDispatcherInOrder) {
    JackPeer keyboard;
    RtMidiInputPort jackIn;
    const int device = jackIn.deviceNames().indexOf(keyboard.playingPort());
    ASSERT_GE(device, 0) << jackIn.deviceNames().join(", ").toStdString();
    ASSERT_TRUE(jackIn.open(device)) << jackIn.errorText().toStdString();
    midiOut.setDeviceNames({QStringLiteral("Synth")});
    ASSERT_TRUE(midiOut.open(0));
    MidiInputPump pump{jackIn, dispatcher, [this](int note, bool pressed) {
                           keys.push_back({note, pressed});
                       }};

    keyboard.send({144, 60, 100});
    keyboard.send({0xFE});          // active sensing, ignored by the port
    keyboard.send({144, 73, 100});  // not a pad
    // A program change has one data byte: the missing second one reads as 0, a note-off to the
    // held pad, which therefore does not start.
    keyboard.send({192, 64});
    keyboard.send({128, 60, 0});

    std::vector<ShortMessage> expected = kSlotNoteOn;
    expected.push_back(kSlotNoteOff);
    EXPECT_TRUE(QTest::qWaitFor([&] { return midiOut.sent.size() >= expected.size(); }));
    EXPECT_EQ(midiOut.sent, expected);
    EXPECT_EQ(keys, (std::vector<KeyShown>{{60, true}, {60, false}}));
    EXPECT_EQ(channels.log.count(QStringLiteral("64 start")), 0);
    EXPECT_EQ(jackIn.droppedMessages(), 0u);
}

// With JACK, the program's MIDI Out port is a source for everyone else and its MIDI In port a
// destination; the program's own lists, and so the fingerprint, must not change with them.
TEST_F(JackMidiTest, OwnPortsNeverShowAmongTheDevices) {
    JackPeer peer;
    RtMidiInputPort jackIn;
    RtMidiOutputPort jackOut;
    MidiSetup jackSetup{
        context, jackIn, jackOut, [this](const QString& text) { statusTexts.append(text); }, {}};
    auto fingerprint = [&] {
        context.MidiDeviceNamesLength = 0;
        jackSetup.VerifyMidiDevices();
        return context.MidiDeviceNamesLength;
    };
    context.MidiInDevice = static_cast<int>(jackIn.deviceNames().indexOf(peer.playingPort()));
    context.MidiOutDevice = static_cast<int>(jackOut.deviceNames().indexOf(peer.listeningPort()));

    // Test programs running beside this one may add or remove ports in between; a filter that
    // lets our own ports through makes every attempt differ.
    bool unchanged = false;
    for (int attempt = 0; attempt < 3 && !unchanged; ++attempt) {
        jackSetup.CloseMidiInPort();
        jackSetup.CloseMidiOutPort();
        const int closed = fingerprint();
        jackSetup.OpenMidiInPort();
        jackSetup.OpenMidiOutPort();
        ASSERT_TRUE(jackIn.isOpen());
        ASSERT_TRUE(jackOut.isOpen());
        unchanged = fingerprint() == closed;
    }
    EXPECT_TRUE(unchanged);
    for (const QString& name : jackIn.deviceNames() + jackOut.deviceNames()) {
        EXPECT_FALSE(name.startsWith(QStringLiteral("Orvelle Quindara"))) << name.toStdString();
    }
    // The others do see them.
    EXPECT_EQ(peer.sources().filter(QStringLiteral("Orvelle Quindara MIDI Out")).size(), 1);
    EXPECT_EQ(peer.destinations().filter(QStringLiteral("Orvelle Quindara MIDI In")).size(), 1);

    // A device index that no longer exists fails cleanly and leaves the port closed.
    context.MidiOutDevice = jackOut.deviceCount() + 3;
    jackSetup.OpenMidiOutPort();
    EXPECT_FALSE(jackOut.isOpen());
    EXPECT_FALSE(jackOut.errorText().isEmpty());
    EXPECT_EQ(statusTexts, (QStringList{QStringLiteral("No avaliable Midi Out Devices detected")}));
}
