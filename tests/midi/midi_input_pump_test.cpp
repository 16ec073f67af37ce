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

TEST_F(MidiInputPumpTest, OnlyNotesAndControllersAboutThePadsPlay) {
    // Outside the pads; then pressure, program change, pitch bend on any channel and system
    // messages, whose first data byte is a value that happens to name a pad.
    Play({{144, 56, 100},
          {144, 73, 100},
          {128, 56, 0},
          {254, 60, 0},
          {224, 64, 100},
          {225, 64, 100},
          {239, 64, 100},
          {160, 64, 100},
          {175, 64, 100},
          {192, 64, 0},
          {208, 64, 0},
          {240, 64, 100},
          {242, 64, 100}});
    EXPECT_TRUE(midiOut.sent.empty());
    EXPECT_TRUE(keys.empty());
    EXPECT_EQ(Starts(64), 0);

    // A controller numbered like a pad plays it, on any channel (a sustain pedal on pad 64).
    Play({{176, 64, 127}, {176, 64, 0}, {191, 64, 127}});
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

// A pad whose file fails shows its box once the burst is dispatched; while it is up, MIDI In goes
// on playing, and the same pad struck again adds no second box.
TEST_F(MidiInputPumpTest, AFailingPadsMessageBoxNeverHoldsUpTheOtherNotes) {
    channels.channel(64).unloadableFiles.append(QStringLiteral("/sounds/pad.wav"));
    std::size_t sentWhileShown = 0;
    prompts.whileShown = [&] {
        prompts.whileShown = nullptr;
        Play({{144, 64, 100}, {144, 60, 90}});
        sentWhileShown = midiOut.sent.size();
    };
    Play({{144, 64, 100}, {144, 64, 0}});
    ASSERT_TRUE(QTest::qWaitFor([&] { return !prompts.shownMessages.isEmpty(); }, 5000));
    QTest::qWait(20);

    EXPECT_EQ(sentWhileShown, kSlotNoteOn.size()) << "pad 60 sounded while the box was up";
    ASSERT_EQ(prompts.shownMessages.size(), 1);
    EXPECT_TRUE(prompts.shownMessages[0].text.startsWith("Problem playing specified audio file"));
    EXPECT_TRUE(prompts.shownMessages[0].text.contains("64"));
    EXPECT_TRUE(prompts.shownMessages[0].text.contains("/sounds/pad.wav"));

    // Once it is closed, the pad may report its next failure.
    Play({{144, 64, 100}});
    EXPECT_TRUE(QTest::qWaitFor([&] { return prompts.shownMessages.size() == 2; }, 5000));
}
