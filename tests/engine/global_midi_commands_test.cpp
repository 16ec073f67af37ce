#include "engine/global_midi_commands.h"
#include "dispatch_fixture.h"

namespace {

struct GlobalMidiCommandsTest : DispatchTest {
    GlobalMidiCommands commands{context, names};

    QStringList PadField(QString NoteSlot::*field) const {
        QStringList values;
        for (int note = kFirstPad; note <= kLastPad; ++note)
            values << context.NoteSlots[note].*field;
        return values;
    }
};

}  // namespace

TEST_F(GlobalMidiCommandsTest, TransposeStopsAtFiftyEitherWay) {
    context.GlobalTranspose = 50;
    const NoteSlotTable before = context.NoteSlots;
    EXPECT_FALSE(commands.TransposeUp().has_value());
    EXPECT_EQ(context.GlobalTranspose, 50);
    EXPECT_TRUE(context.NoteSlots == before);
    EXPECT_FALSE(context.FileChanged);

    const auto shown = commands.TransposeDown();
    ASSERT_TRUE(shown.has_value());
    EXPECT_EQ(commands.TransposeInfoText(), "MIDI Transpose = 49");
    EXPECT_FALSE(shown->green);
    EXPECT_TRUE(shown->infoBar);
    EXPECT_EQ(shown->labels, PadField(&NoteSlot::MidiNoteNumber));
    EXPECT_EQ(shown->labels.first(), "56");
    EXPECT_EQ(shown->labels.last(), "71");
    EXPECT_TRUE(context.FileChanged);

    context.GlobalTranspose = -50;
    context.FileChanged = false;
    const NoteSlotTable low = context.NoteSlots;
    EXPECT_FALSE(commands.TransposeDown().has_value());
    EXPECT_TRUE(context.NoteSlots == low);
    EXPECT_FALSE(context.FileChanged);
    ASSERT_TRUE(commands.TransposeUp().has_value());
    EXPECT_EQ(commands.TransposeInfoText(), "MIDI Transpose = -49");
}

TEST_F(GlobalMidiCommandsTest, NotesWrapAtTheEndsAndDescriptionsFollowTheMidiSlots) {
    context.NoteSlots[36].MidiChannel = "9";  // a drum slot
    context.NoteSlots[36].Description = "MIDI Drum Note  Bass Drum 1";
    MakeWavePad(60, "0").Description = "Wave Sound /sounds/hit.wav";
    const NoteSlotTable before = context.NoteSlots;

    commands.TransposeUp();
    EXPECT_EQ(context.NoteSlots[127].MidiNoteNumber, "0");
    EXPECT_EQ(context.NoteSlots[127].Description, "MIDI Note C 0  Acoustic Grand Piano");
    EXPECT_EQ(context.NoteSlots[36].Description, "MIDI Drum Note  Side Stick");
    EXPECT_EQ(context.NoteSlots[60].MidiNoteNumber, "61");
    EXPECT_EQ(context.NoteSlots[60].Description, "Wave Sound /sounds/hit.wav");

    // The table is what plays: slot 62 now sends note 63.
    dispatcher.ProcessInputData(144, 62, 100);
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 63, 127}));

    commands.TransposeDown();
    EXPECT_TRUE(context.NoteSlots == before) << "a step up and a step down cancel";
    EXPECT_EQ(commands.TransposeInfoText(), "MIDI Transpose = 0");

    commands.TransposeDown();
    EXPECT_EQ(context.NoteSlots[0].MidiNoteNumber, "127");
    EXPECT_EQ(context.NoteSlots[0].Description, "MIDI Note G 127  Acoustic Grand Piano");
    commands.TransposeDown();
    commands.TransposeDown();
    EXPECT_EQ(commands.TransposeInfoText(), "MIDI Transpose = -3");
    EXPECT_EQ(context.NoteSlots[0].MidiNoteNumber, "125");
}

TEST_F(GlobalMidiCommandsTest, VelocityStaysWithinAMidiByteAndShowsGreen) {
    // After the reset every slot has the default velocity 127: "Up" has nothing to change.
    const GlobalMidiCommands::Shown up = commands.VelocityUp();
    EXPECT_TRUE(up.green);
    EXPECT_FALSE(up.infoBar);
    EXPECT_EQ(up.labels, QStringList(16, "127"));
    EXPECT_FALSE(context.FileChanged);

    context.NoteSlots[58].MidiVelocity = "0";
    context.NoteSlots[59].MidiVelocity = "abc";
    const QString description = context.NoteSlots[57].Description;
    const GlobalMidiCommands::Shown down = commands.VelocityDown();
    EXPECT_TRUE(down.green);
    EXPECT_EQ(down.labels.mid(0, 3), QStringList({"126", "0", "0"}));
    EXPECT_EQ(context.NoteSlots[0].MidiVelocity, "126");
    EXPECT_EQ(context.NoteSlots[57].Description, description);
    EXPECT_EQ(context.GlobalTranspose, 0);
    EXPECT_TRUE(context.FileChanged);

    dispatcher.ProcessInputData(144, 57, 100);
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 57, 126}));
}
