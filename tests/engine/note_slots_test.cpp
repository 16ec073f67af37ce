#include "dispatch_fixture.h"

using SlotTableTest = DispatchTest;  // after a reset with no stored defaults

TEST_F(SlotTableTest, ResetGivesEverySlotItsOwnNoteAndTheSameDefaults) {
    context.NoteSlots[60].WaveFileName = QStringLiteral("/tmp/kick.wav");
    context.NoteSlots[60].WavePlaying = QStringLiteral("True");
    InitializeAllMidiNotes(context, names, channels);
    const auto withoutNote = [&](int n) {
        NoteSlot slot = context.NoteSlots[n];
        EXPECT_EQ(slot.MidiNoteNumber, QString::number(n));
        slot.MidiNoteNumber = slot.Description = "";
        return slot;
    };
    for (int n = 0; n < kSlotCount; ++n) EXPECT_EQ(withoutNote(n), withoutNote(0)) << n;
    EXPECT_EQ(QStringList({context.NoteSlots[60].WaveFileName, context.NoteSlots[60].WavePlaying,
                           context.NoteSlots[60].Description}),
              QStringList({"", "False", "MIDI Note C 60  Acoustic Grand Piano"}));
    // Each pad's channel lets go of its wave, in pad order, and nothing else is asked of them.
    QStringList expected;
    for (int note = kFirstPad; note <= kLastPad; ++note)
        expected << QString::number(note) + " close";
    EXPECT_EQ(channels.log, expected);
}

TEST_F(SlotTableTest, StoredDefaultsAreReadLenientlyAndCopiedIntoEverySlot) {
    MemorySettingsStore settings;
    const char* stored[][2] = {{"MidiChannel", "9"},     {"MidiBank", " 3"},
                               {"MidiVelocity", "abc"},  {"MidiPatch", "40 violins"},
                               {"MidiMainVolume", "90"}, {"MetronomeSound", "False"}};
    for (const auto& [key, text] : stored) settings.setValue("Defaults", key, text);
    GetStartupDefaults(context, settings);
    EXPECT_EQ(
        QList<int>({context.DefaultMidiChannel, context.DefaultMidiBank,
                    context.DefaultMidiVelocity, context.DefaultMidiPatch, context.MidiMainVolume}),
        QList<int>({9, 3, 0, 40, 90}))
        << "unreadable text is 0, not the built-in 127";
    EXPECT_EQ(context.MetronomeSound, "False");

    InitializeAllMidiNotes(context, names, channels);
    const NoteSlot& slot = context.NoteSlots[38];
    EXPECT_EQ(QStringList({slot.MidiChannel, slot.MidiBank, slot.MidiVelocity, slot.MidiPatch}),
              QStringList({"9", "3", "0", "40"}));
    EXPECT_EQ(slot.Description, "MIDI Drum Note  Acoustic Snare");
}

TEST_F(SlotTableTest, SingleSlotResetKeepsVolumePlayingStateAndChannel) {
    NoteSlot expected = context.NoteSlots[60];
    expected.Reserved1 = "0";
    NoteSlot& slot = MakeWavePad(60, "3", "/tmp/snare.wav");
    slot.WaveVolume = expected.WaveVolume = "-2000";
    slot.WavePlaying = expected.WavePlaying = "True";
    slot.Reserved2 = expected.Reserved2 = "7";
    slot.MidiNoteNumber = "64";
    slot.MidiPatch = "40";
    SetDefaultMidiNote(context, 60, names);
    EXPECT_EQ(slot, expected);
    EXPECT_TRUE(channels.log.isEmpty());
    SetDefaultMidiNote(context, 128, names);  // not a slot: nothing to reset
    SetDefaultMidiNote(context, -1, names);
}
