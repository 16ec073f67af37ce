#include "midi_fixture.h"

#include "midi/midi_input_pump.h"

#include <QTest>

namespace {

// The real pump between the loopback MIDI In and the real dispatcher. Notes 56 and 73 are MIDI
// slots too, so anything the pump let through from them would show on MIDI Out.
struct MidiInputPumpTest : MidiTest {
    MidiInputPump pump{midiIn, dispatcher, [this](int note, bool pressed) {
                           keys.push_back({note, pressed});
                       }};

    void SetUp() override {
        midiIn.setDeviceNames({QStringLiteral("Keys")});
        midiOut.setDeviceNames({QStringLiteral("Synth")});
        ASSERT_TRUE(midiIn.open(0));
        ASSERT_TRUE(midiOut.open(0));
        for (int note : {56, 60, 73}) MakeMidiSlot(note);
        MakeHeldWavePad(64);
    }

    // Injects the messages and lets the event loop run the pump until the queue is empty.
    void Play(std::initializer_list<ShortMessage> messages) {
        for (const ShortMessage& message : messages) midiIn.inject(message);
        ASSERT_TRUE(QTest::qWaitFor([this] { return midiIn.queueLength() == 0; }, 5000));
    }

    int Starts(int note) const { return channels.log.count(QString::number(note) + " start"); }
};

}  // namespace

TEST_F(MidiInputPumpTest, NoteOnAndOffReachTheDispatcherAndMoveTheKey) {
    Play({{144, 60, 90}, {144, 60, 0}, {144, 60, 70}, {128, 60, 64}});

    std::vector<ShortMessage> expected = kSlotNoteOn;
    expected.push_back(kSlotNoteOff);
    expected.insert(expected.end(), kSlotNoteOn.begin(), kSlotNoteOn.end());
    expected.push_back(kSlotNoteOff);
    EXPECT_EQ(midiOut.sent, expected);
    EXPECT_EQ(keys, (std::vector<KeyShown>{{60, true}, {60, false}, {60, true}, {60, false}}));
}

TEST_F(MidiInputPumpTest, DropsNotesOutsideThePadsActiveSensingAndFirstChannelPitchBend) {
    Play({{144, 56, 100}, {144, 73, 100}, {128, 56, 0}, {254, 60, 0}, {224, 64, 100}});
    EXPECT_TRUE(midiOut.sent.empty());
    EXPECT_TRUE(keys.empty());
    EXPECT_EQ(Starts(64), 0);

    // Pitch bend on the second channel and a controller numbered like a pad are dispatched.
    Play({{225, 64, 100}});
    EXPECT_EQ(Starts(64), 1);
    Play({{225, 64, 0}});
    Play({{176, 64, 127}});
    EXPECT_EQ(Starts(64), 2);
    EXPECT_TRUE(keys.empty());
}

TEST_F(MidiInputPumpTest, NotesOnOtherChannelsSoundButLeaveTheKeysAlone) {
    Play({{145, 60, 100}, {129, 60, 0}});
    std::vector<ShortMessage> expected = kSlotNoteOn;
    expected.push_back(kSlotNoteOff);
    EXPECT_EQ(midiOut.sent, expected);
    EXPECT_TRUE(keys.empty());
}

// A message box shown while a message is handled runs the event loop, which may wake the pump
// again: the messages behind it must still be handled once each, in order.
TEST_F(MidiInputPumpTest, AMessageBoxDuringDispatchDoesNotHandleAMessageTwice) {
    channels.channel(64).unloadableFiles.append(QStringLiteral("/sounds/pad.wav"));
    prompts.whileShown = [this] {
        prompts.whileShown = nullptr;  // one nested loop is enough to tell
        pump.Pump();
    };
    Play({{144, 64, 100}, {144, 60, 90}, {144, 60, 0}});

    EXPECT_EQ(prompts.shownMessages.size(), 1);
    std::vector<ShortMessage> expected = kSlotNoteOn;
    expected.push_back(kSlotNoteOff);
    EXPECT_EQ(midiOut.sent, expected);
    EXPECT_EQ(keys, (std::vector<KeyShown>{{64, true}, {60, true}, {60, false}}));
}
