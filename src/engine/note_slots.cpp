#include "engine/note_slots.h"

#include "base/text_values.h"
#include "components/audio/playback/wave_channel.h"
#include "components/settings/settings_store.h"
#include "engine/gm_names.h"

namespace {

// The fields both reset operations set in the same way.
void ResetMidiAndWaveFields(const Context& context, int index, NoteSlot& slot) {
    slot.NoteFunction = QStringLiteral("0");
    slot.MidiNoteNumber = NumberText(index);
    slot.MidiChannel = NumberText(context.DefaultMidiChannel);
    slot.MidiVelocity = NumberText(context.DefaultMidiVelocity);
    slot.MidiPatch = NumberText(context.DefaultMidiPatch);
    slot.MidiBank = NumberText(context.DefaultMidiBank);
    slot.MidiPan = QStringLiteral("63");
    slot.WavePan = QStringLiteral("0");
    slot.WaveFrequency = QStringLiteral("0");
    slot.WaveLooped = BooleanText(false);
    slot.WaveHoldToPlay = BooleanText(false);
    slot.WaveToggleOnOff = BooleanText(false);
    slot.WaveAssigned = BooleanText(false);
    slot.WavePlayMode = QStringLiteral("0");
    slot.WaveFileName.clear();
    slot.Reserved3 = QStringLiteral("0");
}

}  // namespace

void InitializeAllMidiNotes(Context& context, const GmNames& names, WaveChannels& channels) {
    for (int index = 0; index < kSlotCount; ++index) {
        NoteSlot& slot = context.NoteSlots[index];
        ResetMidiAndWaveFields(context, index, slot);
        slot.WaveVolume = QStringLiteral("0");
        slot.WavePlaying = BooleanText(false);
        slot.Reserved1 = QString();
        slot.Reserved2 = QStringLiteral("0");
        // Last: the description depends on the channel and patch just set.
        slot.Description = names.GetMidiInfoText(index, slot);
    }
    for (int note = kFirstPad; note <= kLastPad; ++note) channels.channel(note).close();
}

void SetDefaultMidiNote(Context& context, int index, const GmNames& names) {
    if (!IsSlot(index)) return;
    NoteSlot& slot = context.NoteSlots[index];
    ResetMidiAndWaveFields(context, index, slot);
    slot.Reserved1 = QStringLiteral("0");
    slot.Description = names.GetMidiInfoText(index, slot);
}

void GetStartupDefaults(Context& context, const SettingsStore& settings) {
    const QString section = QStringLiteral("Defaults");
    auto number = [&](const char* key, int fallback) {
        return LenientNumber(
            settings.value(section, QString::fromLatin1(key), NumberText(fallback)));
    };
    context.DefaultMidiChannel = number("MidiChannel", 0);
    context.DefaultMidiBank = number("MidiBank", 0);
    context.DefaultMidiVelocity = number("MidiVelocity", 127);
    context.DefaultMidiPatch = number("MidiPatch", 0);
    context.MidiMainVolume = number("MidiMainVolume", 100);
    context.DefaultMetronomeNote = number("DefaultMetronomeNote", 37);
    context.MetronomeVelocity = number("DefaultMetronomeVelocity", 120);
    context.MetronomeSound =
        settings.value(section, QStringLiteral("MetronomeSound"), BooleanText(true));
}
