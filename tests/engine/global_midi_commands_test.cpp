// The keys, the limit of +50, the labels and their colours are driven through the window in
// tests/app; here what the commands do to the table.
#include "engine/global_midi_commands.h"
#include "dispatch_fixture.h"

namespace {

struct GlobalMidiCommandsTest : DispatchTest {
    GlobalMidiCommands commands{context, names};
};

}  // namespace

TEST_F(GlobalMidiCommandsTest, TransposeWrapsNotesFollowsDescriptionsAndStopsAtMinusFifty) {
    context.NoteSlots[36].MidiChannel = "9";  // a drum slot
    context.NoteSlots[36].Description = "MIDI Drum Note  Bass Drum 1";
    MakeWavePad(60, "0").Description = "Wave Sound /sounds/hit.wav";
    const NoteSlotTable before = context.NoteSlots;
    ASSERT_TRUE(commands.TransposeUp().has_value());
    EXPECT_EQ(context.NoteSlots[127].MidiNoteNumber, "0");
    EXPECT_EQ(context.NoteSlots[127].Description, "MIDI Note C 0  Acoustic Grand Piano");
    EXPECT_EQ(context.NoteSlots[36].Description, "MIDI Drum Note  Side Stick");
    EXPECT_EQ(context.NoteSlots[60].Description, "Wave Sound /sounds/hit.wav");
    EXPECT_TRUE(context.FileChanged);
    // The table is what plays: slot 62 now sends note 63.
    dispatcher.ProcessInputData(144, 62, 100);
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 63, 127}));
    commands.TransposeDown();
    EXPECT_TRUE(context.NoteSlots == before) << "a step up and a step down cancel";
    commands.TransposeDown();
    EXPECT_EQ(context.NoteSlots[0].MidiNoteNumber, "127");

    context.GlobalTranspose = -50;
    context.FileChanged = false;
    const NoteSlotTable atLimit = context.NoteSlots;
    EXPECT_FALSE(commands.TransposeDown().has_value());
    EXPECT_EQ(context.GlobalTranspose, -50);
    EXPECT_TRUE(context.NoteSlots == atLimit);
    EXPECT_FALSE(context.FileChanged);
}

TEST_F(GlobalMidiCommandsTest, VelocityStaysWithinAMidiByteInEverySlot) {
    commands.VelocityUp();  // every slot already has 127
    EXPECT_FALSE(context.FileChanged);
    context.NoteSlots[58].MidiVelocity = "0";
    context.NoteSlots[59].MidiVelocity = "abc";
    const QString description = context.NoteSlots[57].Description;
    EXPECT_EQ(commands.VelocityDown().labels.mid(0, 3), QStringList({"126", "0", "0"}));
    EXPECT_EQ(context.NoteSlots[57].Description, description);
    EXPECT_EQ(context.NoteSlots[0].MidiVelocity, "126") << "every slot, not only the pads";
    EXPECT_TRUE(context.FileChanged);
    dispatcher.ProcessInputData(144, 57, 100);
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 57, 126}));
}
