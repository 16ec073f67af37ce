#include "engine/pad_controls.h"
#include "dispatch_fixture.h"

namespace {

// The pads over the real dispatcher and wave playback, with every drawing call written down.
// The window drives the same controls in tests/app; here the cases it does not reach.
struct PadControlsTest : DispatchTest {
    QStringList shown;
    PadControls pads{
        context, channels, dispatcher, names,
        PadControls::Display{
            [this](int note, bool pressed) {
                shown << QStringLiteral("key %1 %2").arg(note).arg(pressed ? "down" : "up");
            },
            [this] { shown << "hide marker"; },
            [this](int note) { shown << QStringLiteral("marker %1").arg(note); },
            [this](int note) { shown << QStringLiteral("picker %1").arg(note); },
            [this](const QString& text) { shown << "status " + text; }}};
};

}  // namespace

TEST_F(PadControlsTest, LoopSwitchWritesTheFourPlayModeFieldsAndTheChannelsLooping) {
    const struct {
        int position;
        QStringList fields;  // mode, looped, hold to play, toggle
        QStringList channelLog;
    } cases[] = {{3, {"3", "True", "False", "True"}, {"60 looping on"}},
                 {1, {"1", "False", "False", "False"}, {"60 looping off"}},
                 // A position the switch does not have is stored as the mode and nothing else.
                 {4, {"4", "False", "False", "False"}, {}}};
    const NoteSlot& slot = context.NoteSlots[60];
    for (const auto& c : cases) {
        channels.log.clear();
        pads.LoopOptionChanged(60, c.position);
        EXPECT_EQ(QStringList({slot.WavePlayMode, slot.WaveLooped, slot.WaveHoldToPlay,
                               slot.WaveToggleOnOff}),
                  c.fields);
        EXPECT_EQ(channels.log, c.channelLog);
    }
    EXPECT_TRUE(context.FileChanged);
    EXPECT_EQ(PadControls::LoopOptionToolTip(-1) + PadControls::LoopOptionToolTip(4), "");
}

TEST_F(PadControlsTest, TheModeSelectorNamesTheWaveOrTheSlotsOwnNote) {
    NoteSlot& slot = context.NoteSlots[65];
    const QString midiDescription = slot.Description;
    slot.WaveFileName = "/sounds/bell.wav";
    pads.ModeSelectorChanged(65, 1);
    EXPECT_EQ(slot.Description, "Wave Sound /sounds/bell.wav");
    slot.MidiNoteNumber = "70";  // moved by a transpose
    pads.ModeSelectorChanged(65, 0);
    EXPECT_EQ(slot.NoteFunction, "0");
    EXPECT_EQ(slot.Description, midiDescription);
    EXPECT_TRUE(channels.log.isEmpty()) << "the mode does not touch the channel";
}

TEST_F(PadControlsTest, ControlsKeepTheFloorAndOnlyRealChangesAreSaved) {
    pads.VolumeChanged(57, -10000);  // below the floor the fader has after start-up
    EXPECT_EQ(context.NoteSlots[57].WaveVolume, "-5000");
    pads.PanChanged(58, -7500);

    // A control moved back to the value it has, a switch reporting its change twice, and a note
    // without a pad are no change to save; the last has no channel either.
    context.FileChanged = false;
    pads.LoopOptionChanged(60, 0);
    pads.ModeSelectorChanged(61, 0);
    channels.log.clear();
    pads.PanChanged(58, -7500);
    pads.VolumeChanged(40, -100);
    pads.LoopOptionChanged(73, 2);
    EXPECT_EQ(channels.log, QStringList({"58 pan -7500"}));
    EXPECT_EQ(context.NoteSlots[40].WaveVolume, "0");
    EXPECT_FALSE(context.FileChanged);
}

TEST_F(PadControlsTest, PressingAHeldKeyAgainPlaysOnceAndReleaseRaisesEveryHeldKey) {
    pads.KeyPressed(60);
    pads.KeyPressed(60);
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 60, 127})) << "the slot's own velocity";
    // Dragging onto another key while the button is down plays that one too.
    pads.KeyPressed(62);
    shown.clear();
    pads.KeyReleased(62);
    EXPECT_EQ(Notes(), QStringList({"60 on", "62 on", "62 off"}));
    EXPECT_EQ(shown, QStringList({"key 60 up", "key 62 up"}));
    EXPECT_EQ(pads.HeldKeyCount(), 0);
    // The held keys are counted up to 750; further presses overwrite the last entry, never
    // write beyond the list.
    context.DefaultMidiVelocity = 0;  // silent presses keep the message log small
    midiOut.sent.clear();
    for (int i = 0; i < 760; ++i) pads.KeyPressed(i % 2 ? 58 : 57);
    EXPECT_EQ(pads.HeldKeyCount(), 750);
    // Past the cap the last counted entry stays 58, so only the presses of 57 still play.
    EXPECT_EQ(midiOut.sent.size(), 755u);
    shown.clear();
    pads.KeyReleased(57);
    EXPECT_EQ(shown.size(), 750) << "the entry past the count is not raised";
    EXPECT_FALSE(context.FileChanged);
}

TEST_F(PadControlsTest, AClickNamesTheNoteTheSlotNowSendsAndOnlyThatIsSaved) {
    context.NoteSlots[64].MidiNoteNumber = "36";  // changed by the note picker
    context.NoteSlots[64].MidiPatch = "1";
    pads.KeyClicked(64);
    EXPECT_EQ(context.NoteSlots[64].Description, "MIDI Note C 36  Bright Acoustic Piano");
    EXPECT_EQ(shown, QStringList({"picker 64", "marker 64"}));
    EXPECT_TRUE(context.FileChanged);
    // Clicking again, or clicking a wave pad, changes nothing to save.
    context.FileChanged = false;
    pads.KeyClicked(64);
    MakeWavePad(66, "0").Description = "Wave Sound /sounds/hit.wav";
    pads.KeyClicked(66);
    EXPECT_EQ(context.CurrentSlot, 66);
    EXPECT_EQ(context.NoteSlots[66].Description, "Wave Sound /sounds/hit.wav");
    EXPECT_FALSE(context.FileChanged);
}
