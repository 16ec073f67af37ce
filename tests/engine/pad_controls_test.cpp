#include "engine/pad_controls.h"
#include "dispatch_fixture.h"

namespace {

// The pads over the real dispatcher and wave playback, with every drawing call written down.
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

QStringList PlayModeFields(const NoteSlot& slot) {
    return {slot.WavePlayMode, slot.WaveLooped, slot.WaveHoldToPlay, slot.WaveToggleOnOff};
}

}  // namespace

TEST_F(PadControlsTest, LoopSwitchWritesTheFourPlayModeFieldsAndTheChannelsLooping) {
    pads.LoopOptionChanged(60, 2);
    EXPECT_EQ(PlayModeFields(context.NoteSlots[60]), QStringList({"2", "True", "True", "False"}));
    EXPECT_EQ(channels.log, QStringList({"60 looping on"}));
    EXPECT_EQ(PadControls::LoopOptionToolTip(2), "Play Wave Sound Looped - Hold to play");
    EXPECT_TRUE(context.FileChanged);

    // The same position again still sets the channel but changes no stored field.
    context.FileChanged = false;
    pads.LoopOptionChanged(60, 2);
    EXPECT_FALSE(context.FileChanged);

    pads.LoopOptionChanged(60, 3);
    EXPECT_EQ(PlayModeFields(context.NoteSlots[60]), QStringList({"3", "True", "False", "True"}));
    pads.LoopOptionChanged(60, 1);
    EXPECT_EQ(PlayModeFields(context.NoteSlots[60]), QStringList({"1", "False", "False", "False"}));
    EXPECT_EQ(channels.log.last(), "60 looping off");
    EXPECT_TRUE(context.FileChanged);

    EXPECT_EQ(PadControls::LoopOptionToolTip(0), "Play Wave Sound Once - Can retrigger");
    EXPECT_EQ(PadControls::LoopOptionToolTip(1), "Play Wave Sound Once - No retrigger");
    EXPECT_EQ(PadControls::LoopOptionToolTip(3), "Play Wave Sound Looped - Toggle On/Off");
    EXPECT_EQ(PadControls::LoopOptionToolTip(-1), "");
    EXPECT_EQ(PadControls::LoopOptionToolTip(4), "");

    // A position the switch does not have is stored as the mode and nothing else happens.
    channels.log.clear();
    pads.LoopOptionChanged(60, 4);
    EXPECT_EQ(PlayModeFields(context.NoteSlots[60]), QStringList({"4", "False", "False", "False"}));
    EXPECT_TRUE(channels.log.isEmpty());
}

TEST_F(PadControlsTest, ModeSelectorSetsTheFunctionAndTheDescription) {
    const QString midiDescription = context.NoteSlots[65].Description;
    ASSERT_EQ(midiDescription, "MIDI Note F 65  Acoustic Grand Piano");

    pads.ModeSelectorChanged(65, 1);
    EXPECT_EQ(context.NoteSlots[65].NoteFunction, "1");
    EXPECT_EQ(context.NoteSlots[65].Description, "No sound file selected");
    EXPECT_TRUE(context.FileChanged);

    // The switch reports a change twice; the second report changes nothing.
    context.FileChanged = false;
    pads.ModeSelectorChanged(65, 1);
    EXPECT_FALSE(context.FileChanged);

    // Back to MIDI: the slot's own note is named even when a transpose moved the note it sends.
    context.NoteSlots[65].MidiNoteNumber = "70";
    pads.ModeSelectorChanged(65, 0);
    EXPECT_EQ(context.NoteSlots[65].NoteFunction, "0");
    EXPECT_EQ(context.NoteSlots[65].Description, midiDescription);
    EXPECT_TRUE(context.FileChanged);

    context.NoteSlots[65].WaveFileName = "/sounds/bell.wav";
    pads.ModeSelectorChanged(65, 1);
    EXPECT_EQ(context.NoteSlots[65].Description, "Wave Sound /sounds/bell.wav");
    EXPECT_EQ(pads.CompileWaveInfo(66), "Wave Sound - no file selected");
    EXPECT_TRUE(channels.log.isEmpty()) << "the mode does not touch the channel";
}

TEST_F(PadControlsTest, VolumePanAndFrequencyGoToTheChannelAndTheSlot) {
    pads.VolumeChanged(57, -2000);
    pads.PanChanged(58, -7500);
    pads.FrequencyChanged(59, 22050);
    EXPECT_EQ(channels.log, QStringList({"57 volume -2000", "58 pan -7500", "59 frequency 22050"}));
    EXPECT_EQ(context.NoteSlots[57].WaveVolume, "-2000");
    EXPECT_EQ(context.NoteSlots[58].WavePan, "-7500");
    EXPECT_EQ(context.NoteSlots[59].WaveFrequency, "22050");
    EXPECT_TRUE(context.FileChanged);

    // The volume slider's design range reaches -10000, but the floor after start-up holds.
    pads.VolumeChanged(57, -10000);
    EXPECT_EQ(channels.channel(57).volume, PadControls::kVolumeFloor);
    EXPECT_EQ(context.NoteSlots[57].WaveVolume, "-5000");
    pads.VolumeChanged(57, 300);
    EXPECT_EQ(context.NoteSlots[57].WaveVolume, "0");

    // Moving a control back to the value it already has is no change to save.
    context.FileChanged = false;
    pads.VolumeChanged(57, 0);
    pads.PanChanged(58, -7500);
    pads.FrequencyChanged(59, 22050);
    EXPECT_FALSE(context.FileChanged);

    // A note without a pad has no controls and no channel.
    channels.log.clear();
    pads.VolumeChanged(40, -100);
    pads.LoopOptionChanged(73, 2);
    EXPECT_TRUE(channels.log.isEmpty());
    EXPECT_EQ(context.NoteSlots[40].WaveVolume, "0");
    EXPECT_FALSE(context.FileChanged);
}

TEST_F(PadControlsTest, ViewReadsTheSlotsFieldsLeniently) {
    NoteSlot& slot = context.NoteSlots[62];
    slot.NoteFunction = "1";
    slot.WavePlayMode = "3";
    slot.WaveVolume = "-1234dB";
    slot.WavePan = "abc";
    slot.WaveFrequency = " 44100";
    const PadView view = pads.ViewOf(62);
    EXPECT_EQ(
        QList<int>({view.modePosition, view.loopPosition, view.volume, view.pan, view.frequency}),
        QList<int>({1, 3, -1234, 0, 44100}));
}

TEST_F(PadControlsTest, PressingAHeldKeyAgainPlaysOnceAndReleaseRaisesEveryHeldKey) {
    pads.KeyPressed(60);
    pads.KeyPressed(60);
    EXPECT_EQ(Notes(), QStringList({"60 on"}));
    EXPECT_EQ(midiOut.sent.back(), (ShortMessage{144, 60, 127})) << "the slot's own velocity";
    EXPECT_EQ(pads.HeldKeyCount(), 1);

    // Dragging onto another key while the button is down plays that one too.
    pads.KeyPressed(62);
    EXPECT_EQ(pads.HeldKeyCount(), 2);
    shown.clear();
    pads.KeyReleased(62);
    EXPECT_EQ(Notes(), QStringList({"60 on", "62 on", "62 off"}));
    EXPECT_EQ(shown, QStringList({"key 60 up", "key 62 up"}));
    EXPECT_EQ(pads.HeldKeyCount(), 0);
    EXPECT_FALSE(context.FileChanged);

    // A wave pad follows its play mode: held in mode 2, it stops on release.
    MakeWavePad(63, "2");
    pads.KeyPressed(63);
    EXPECT_TRUE(Sounding(63));
    pads.KeyReleased(63);
    EXPECT_FALSE(Sounding(63));
}

TEST_F(PadControlsTest, HeldKeyCountStopsAt750) {
    context.DefaultMidiVelocity = 0;  // silent presses keep the message log small
    for (int i = 0; i < 760; ++i) pads.KeyPressed(i % 2 ? 58 : 57);
    EXPECT_EQ(pads.HeldKeyCount(), 750);
    // Past the cap the last counted entry stays 58, so only the presses of 57 still play.
    EXPECT_EQ(midiOut.sent.size(), 755u);

    shown.clear();
    pads.KeyReleased(57);
    EXPECT_EQ(shown.size(), 750) << "the entry past the count is not raised";
    EXPECT_EQ(pads.HeldKeyCount(), 0);
}

TEST_F(PadControlsTest, HoverShowsTheDescriptionAndAClickSelectsTheSlot) {
    pads.KeyHovered(64);
    EXPECT_EQ(shown, QStringList({"status MIDI Note E 64  Acoustic Grand Piano"}));

    // The note picker changed what the slot sends; a click names that note.
    shown.clear();
    context.NoteSlots[64].MidiNoteNumber = "36";
    context.NoteSlots[64].MidiPatch = "1";
    pads.KeyClicked(64);
    EXPECT_EQ(context.CurrentSlot, 64);
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
