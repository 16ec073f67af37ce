// Slot messages and note-offs go through the MIDI In pump in tests/midi, the play modes are heard
// in pad_sound_test.cpp; here what only the dispatcher decides.
#include "dispatch_fixture.h"

using MidiSlotDispatch = DispatchTest;
using WaveSlotDispatch = DispatchTest;

TEST_F(MidiSlotDispatch, SlotValuesStayInsideTheirBytesAndOnlyNotesPlay) {
    // The slot index stays, the note sent moves; values outside a data byte are kept inside it,
    // never turned into another message kind.
    NoteSlot& moved = context.NoteSlots[57];
    moved.MidiNoteNumber = "69";
    moved.MidiVelocity = "abc";
    moved.MidiPan = "300";
    moved.MidiBank = "-4";
    dispatcher.ProcessInputData(144, 57, 100);
    EXPECT_EQ(midiOut.sent, Messages({{176, 0, 0}, {192, 0, 0}, {176, 10, 127}, {144, 69, 0}}));

    // Controllers, pitch bend and the like send nothing for a MIDI slot; a note-off on any
    // channel sends one note-on at 0.
    midiOut.sent.clear();
    const int statusAndVelocity[][2] = {{176, 127}, {224, 64}, {127, 64}, {143, 64}};
    for (const auto& [status, velocity] : statusAndVelocity)
        dispatcher.ProcessInputData(status, 57, velocity);
    EXPECT_EQ(midiOut.sent, Messages({{144, 69, 0}}));

    midiOut.sent.clear();
    moved.MidiChannel = "16";
    for (int note : {57, 200, -1}) dispatcher.ProcessInputData(144, note, 100);
    EXPECT_TRUE(midiOut.sent.empty());
}

TEST_F(WaveSlotDispatch, ToggleWithoutASoundFlipsAndUnknownModesPlayNothing) {
    // A toggle pad with no wave assigned plays nothing but still flips its state.
    NoteSlot& empty = MakeWavePad(71, "3", "");
    empty.WaveAssigned = "False";
    QStringList flags;
    for (int i = 0; i < 3; ++i) {
        dispatcher.ProcessInputData(144, 71, 100);
        flags << Playing(71);
    }
    EXPECT_EQ(flags, QStringList({"True", "False", "True"}));
    EXPECT_TRUE(prompts.shownMessages.isEmpty());

    MakeWavePad(60, "7");
    context.NoteSlots[61].NoteFunction = "4";
    MakeWavePad(20, "0");  // wave fields outside the pads are stored but nothing plays them
    for (int note : {60, 61, 20}) dispatcher.ProcessInputData(144, note, 100);
    EXPECT_TRUE(channels.log.isEmpty());
    EXPECT_TRUE(midiOut.sent.empty());
    EXPECT_EQ(Playing(20), "False");
}
