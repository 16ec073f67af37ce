#include "engine/note_slots.h"

#include "components/audio/recording_wave_channels.h"
#include "components/prompts/scripted_prompts.h"
#include "components/settings/memory_settings_store.h"
#include "pickers/gm_names.h"

#include <gtest/gtest.h>

namespace {

struct SlotTableTest : ::testing::Test {
    ScriptedPrompts prompts;
    GmNames names{QStringLiteral(OQ_SOURCE_DATA_DIR "/genmidi.txt"),
                  QStringLiteral(OQ_SOURCE_DATA_DIR "/genmididrums.txt"), prompts};
    RecordingWaveChannels channels;
    MemorySettingsStore settings;
    Context context;
};

}  // namespace

TEST_F(SlotTableTest, ResetWithNoStoredDefaultsGivesTheBuiltInValues) {
    GetStartupDefaults(context, settings);
    context.NoteSlots[60].WaveFileName = QStringLiteral("/tmp/kick.wav");
    context.NoteSlots[60].WavePlaying = QStringLiteral("True");
    InitializeAllMidiNotes(context, names, channels);

    for (int n = 0; n < kSlotCount; ++n) {
        const NoteSlot& slot = context.NoteSlots[n];
        SCOPED_TRACE(n);
        EXPECT_EQ(slot.NoteFunction, "0");
        EXPECT_EQ(slot.MidiNoteNumber, QString::number(n));
        EXPECT_EQ(slot.MidiChannel, "0");
        EXPECT_EQ(slot.MidiVelocity, "127");
        EXPECT_EQ(slot.MidiPatch, "0");
        EXPECT_EQ(slot.MidiBank, "0");
        EXPECT_EQ(slot.MidiPan, "63");
        EXPECT_EQ(slot.WaveVolume, "0");
        EXPECT_EQ(slot.WavePan, "0");
        EXPECT_EQ(slot.WaveFrequency, "0");
        EXPECT_EQ(slot.WavePlayMode, "0");
        EXPECT_EQ(slot.WaveLooped, "False");
        EXPECT_EQ(slot.WaveHoldToPlay, "False");
        EXPECT_EQ(slot.WaveToggleOnOff, "False");
        EXPECT_EQ(slot.WaveFileName, "");
        EXPECT_EQ(slot.WaveAssigned, "False");
        EXPECT_EQ(slot.WavePlaying, "False");
        EXPECT_EQ(slot.Reserved1, "");
        EXPECT_EQ(slot.Reserved2, "0");
        EXPECT_EQ(slot.Reserved3, "0");
    }
    EXPECT_EQ(context.NoteSlots[60].Description, "MIDI Note C 60  Acoustic Grand Piano");

    // Each pad's channel lets go of its wave, in pad order, and nothing else is asked of them.
    QStringList expected;
    for (int note = kFirstPad; note <= kLastPad; ++note)
        expected << QString::number(note) + " close";
    EXPECT_EQ(channels.log, expected);
}

TEST_F(SlotTableTest, StoredDefaultsAreReadLenientlyAndCopiedIntoEverySlot) {
    settings.setValue("Defaults", "MidiChannel", "9");
    settings.setValue("Defaults", "MidiBank", " 3");
    settings.setValue("Defaults", "MidiVelocity", "abc");
    settings.setValue("Defaults", "MidiPatch", "40 violins");
    settings.setValue("Defaults", "MidiMainVolume", "90");
    settings.setValue("Defaults", "MetronomeSound", "False");
    GetStartupDefaults(context, settings);

    EXPECT_EQ(context.DefaultMidiChannel, 9);
    EXPECT_EQ(context.DefaultMidiBank, 3);
    EXPECT_EQ(context.DefaultMidiVelocity, 0) << "unreadable text is 0, not the built-in 127";
    EXPECT_EQ(context.DefaultMidiPatch, 40);
    EXPECT_EQ(context.MidiMainVolume, 90);
    EXPECT_EQ(context.DefaultMetronomeNote, 37);
    EXPECT_EQ(context.MetronomeVelocity, 120);
    EXPECT_EQ(context.MetronomeSound, "False");

    InitializeAllMidiNotes(context, names, channels);
    EXPECT_EQ(context.NoteSlots[38].MidiChannel, "9");
    EXPECT_EQ(context.NoteSlots[38].MidiBank, "3");
    EXPECT_EQ(context.NoteSlots[38].MidiVelocity, "0");
    EXPECT_EQ(context.NoteSlots[38].Description, "MIDI Drum Note  Acoustic Snare");
}

TEST_F(SlotTableTest, SingleSlotResetKeepsVolumePlayingStateAndChannel) {
    GetStartupDefaults(context, settings);
    InitializeAllMidiNotes(context, names, channels);
    channels.log.clear();

    NoteSlot& slot = context.NoteSlots[60];
    slot.NoteFunction = "1";
    slot.WaveVolume = "-2000";
    slot.WaveFileName = "/tmp/snare.wav";
    slot.WaveAssigned = "True";
    slot.WavePlayMode = "3";
    slot.WaveLooped = "True";
    slot.WavePlaying = "True";
    slot.Reserved1 = "";
    slot.Reserved2 = "7";
    slot.MidiNoteNumber = "64";
    slot.MidiPatch = "40";

    SetDefaultMidiNote(context, 60, names);
    EXPECT_EQ(slot.NoteFunction, "0");
    EXPECT_EQ(slot.WaveVolume, "-2000");
    EXPECT_EQ(slot.WavePlaying, "True");
    EXPECT_EQ(slot.Reserved2, "7");
    EXPECT_EQ(slot.Reserved1, "0");
    EXPECT_EQ(slot.WaveFileName, "");
    EXPECT_EQ(slot.WaveAssigned, "False");
    EXPECT_EQ(slot.WavePlayMode, "0");
    EXPECT_EQ(slot.WaveLooped, "False");
    EXPECT_EQ(slot.MidiNoteNumber, "60");
    EXPECT_EQ(slot.Description, "MIDI Note C 60  Acoustic Grand Piano");
    EXPECT_TRUE(channels.log.isEmpty());

    SetDefaultMidiNote(context, 128, names);  // not a slot: nothing to reset
    SetDefaultMidiNote(context, -1, names);
}
