#include "dispatch_fixture.h"

using MidiSlotDispatch = DispatchTest;
using WaveSlotDispatch = DispatchTest;

TEST_F(MidiSlotDispatch, NoteOnSendsBankProgramPanAndNoteOnTheSlotsChannel) {
    NoteSlot& slot = context.NoteSlots[60];
    slot.MidiChannel = "3";
    slot.MidiBank = "2";
    slot.MidiPatch = "5";
    slot.MidiPan = "63";
    slot.MidiNoteNumber = "60";
    slot.MidiVelocity = "100";

    // The incoming channel and velocity do not matter, only that it is a note-on.
    dispatcher.ProcessInputData(144, 60, 1);
    dispatcher.ProcessInputData(159, 60, 127);
    const auto on = Messages({{179, 0, 2}, {195, 5, 0}, {179, 10, 63}, {147, 60, 100}});
    std::vector<ShortMessage> twice = on;
    twice.insert(twice.end(), on.begin(), on.end());
    EXPECT_EQ(midiOut.sent, twice);

    // Note-off statuses with any velocity, and note-on with velocity 0, send one note-on at 0.
    midiOut.sent.clear();
    dispatcher.ProcessInputData(128, 60, 64);
    dispatcher.ProcessInputData(143, 60, 0);
    dispatcher.ProcessInputData(144, 60, 0);
    EXPECT_EQ(midiOut.sent, Messages({{147, 60, 0}, {147, 60, 0}, {147, 60, 0}}));

    // Controllers, pitch bend and the like send nothing for a MIDI slot.
    midiOut.sent.clear();
    dispatcher.ProcessInputData(176, 60, 127);
    dispatcher.ProcessInputData(224, 60, 64);
    dispatcher.ProcessInputData(127, 60, 64);
    EXPECT_TRUE(midiOut.sent.empty());
}

TEST_F(MidiSlotDispatch, TransposedSlotsAndUnreadableValues) {
    NoteSlot& slot = context.NoteSlots[57];
    slot.MidiNoteNumber = "69";  // the slot index stays, the note sent moves
    slot.MidiVelocity = "abc";
    dispatcher.ProcessInputData(144, 57, 100);
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 69, 0}));

    // Values outside a data byte are kept inside it, never turned into another message kind.
    midiOut.sent.clear();
    slot.MidiPan = "300";
    slot.MidiBank = "-4";
    dispatcher.ProcessInputData(144, 57, 100);
    EXPECT_EQ(midiOut.sent, Messages({{176, 0, 0}, {192, 0, 0}, {176, 10, 127}, {144, 69, 0}}));

    midiOut.sent.clear();
    slot.MidiChannel = "16";
    dispatcher.ProcessInputData(144, 57, 100);
    dispatcher.ProcessInputData(144, 200, 100);
    dispatcher.ProcessInputData(144, -1, 100);
    EXPECT_TRUE(midiOut.sent.empty());
}

TEST_F(WaveSlotDispatch, OnceWithRetriggerRestartsOnEveryPress) {
    MakeWavePad(60, "0");
    dispatcher.ProcessInputData(144, 60, 100);
    EXPECT_TRUE(Sounding(60));
    EXPECT_EQ(Playing(60), "True");
    EXPECT_EQ(channels.log, QStringList({"60 file /sounds/hit.wav", "60 frequency 0",
                                         "60 looping off", "60 volume 0", "60 pan 0", "60 start"}));

    dispatcher.ProcessInputData(128, 60, 0);  // release: nothing
    EXPECT_TRUE(Sounding(60));
    dispatcher.ProcessInputData(144, 60, 100);  // press while sounding: stop, then start again
    EXPECT_EQ(Stops(60), 1);
    EXPECT_EQ(Starts(60), 2);
    EXPECT_TRUE(Sounding(60));
    EXPECT_EQ(Playing(60), "True");
    EXPECT_TRUE(midiOut.sent.empty());
}

TEST_F(WaveSlotDispatch, OnceWithoutRetriggerIgnoresPressesWhileSoundingAndNeverStartsOnRelease) {
    MakeWavePad(64, "1");
    dispatcher.ProcessInputData(144, 64, 100);
    dispatcher.ProcessInputData(144, 64, 100);
    dispatcher.ProcessInputData(128, 64, 0);
    EXPECT_EQ(Starts(64), 1);
    EXPECT_EQ(Stops(64), 0);
    EXPECT_TRUE(Sounding(64));

    // The sound ends by itself; a late release must not bring it back.
    channels.endPlayback(64);
    EXPECT_EQ(Playing(64), "False");
    dispatcher.ProcessInputData(144, 64, 0);
    dispatcher.ProcessInputData(128, 64, 90);
    EXPECT_EQ(Starts(64), 1);
    EXPECT_FALSE(Sounding(64));

    // Any status with a velocity starts it: a sustain pedal (controller 64) does too.
    dispatcher.ProcessInputData(176, 64, 127);
    EXPECT_EQ(Starts(64), 2);
    EXPECT_EQ(Playing(64), "True");
}

TEST_F(WaveSlotDispatch, HoldToPlayLoopsWhileHeld) {
    MakeWavePad(62, "2");
    dispatcher.ProcessInputData(144, 62, 100);
    EXPECT_TRUE(Sounding(62));
    EXPECT_TRUE(channels.channel(62).looping);
    dispatcher.ProcessInputData(144, 62, 0);
    EXPECT_FALSE(Sounding(62));
    EXPECT_EQ(Playing(62), "False");
    dispatcher.ProcessInputData(128, 62, 0);  // a second release finds it silent
    EXPECT_EQ(Stops(62), 1);
}

TEST_F(WaveSlotDispatch, ToggleAlternatesEvenWithoutASound) {
    MakeWavePad(70, "3");
    dispatcher.ProcessInputData(144, 70, 100);
    EXPECT_TRUE(Sounding(70));
    dispatcher.ProcessInputData(128, 70, 0);  // releases do nothing
    EXPECT_TRUE(Sounding(70));
    dispatcher.ProcessInputData(144, 70, 100);
    EXPECT_FALSE(Sounding(70));
    EXPECT_EQ(Playing(70), "False");

    // A toggle pad with no wave assigned plays nothing but still flips its state.
    NoteSlot& empty = MakeWavePad(71, "3", "");
    empty.WaveAssigned = "False";
    QStringList flags;
    for (int i = 0; i < 3; ++i) {
        dispatcher.ProcessInputData(144, 71, 100);
        flags << Playing(71);
    }
    EXPECT_EQ(flags, QStringList({"True", "False", "True"}));
    EXPECT_EQ(Starts(71), 0);
    EXPECT_TRUE(prompts.shownMessages.isEmpty());
}

TEST_F(WaveSlotDispatch, UnknownFunctionsAndModesAndSlotsWithoutPads) {
    MakeWavePad(60, "7");
    context.NoteSlots[61].NoteFunction = "4";
    MakeWavePad(20, "0");  // wave fields outside the pads are stored but nothing plays them
    for (int note : {60, 61, 20}) dispatcher.ProcessInputData(144, note, 100);
    EXPECT_TRUE(channels.log.isEmpty());
    EXPECT_TRUE(midiOut.sent.empty());
    EXPECT_EQ(Playing(20), "False");
}
