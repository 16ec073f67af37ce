#include "engine/global_midi_commands.h"

#include "base/text_values.h"
#include "engine/gm_names.h"
#include "engine/note_slots.h"

#include <algorithm>

std::optional<GlobalMidiCommands::Shown> GlobalMidiCommands::TransposeDown() {
    if (context_.GlobalTranspose < -(kTransposeLimit - 1)) return std::nullopt;
    TransposeAll(-1);
    return Shown{PadLabels(&NoteSlot::MidiNoteNumber), false, true};
}

std::optional<GlobalMidiCommands::Shown> GlobalMidiCommands::TransposeUp() {
    if (context_.GlobalTranspose > kTransposeLimit - 1) return std::nullopt;
    TransposeAll(1);
    return Shown{PadLabels(&NoteSlot::MidiNoteNumber), false, true};
}

GlobalMidiCommands::Shown GlobalMidiCommands::VelocityDown() {
    ChangeAllVelocities(-1);
    return Shown{PadLabels(&NoteSlot::MidiVelocity), true, false};
}

GlobalMidiCommands::Shown GlobalMidiCommands::VelocityUp() {
    ChangeAllVelocities(1);
    return Shown{PadLabels(&NoteSlot::MidiVelocity), true, false};
}

QString GlobalMidiCommands::TransposeInfoText() const {
    return QStringLiteral("MIDI Transpose = ") + NumberText(context_.GlobalTranspose);
}

// A note stepping past either end comes in at the other, so a step up and a step down cancel.
// Only a slot that sends MIDI gets a new description; a wave pad keeps naming its file.
void GlobalMidiCommands::TransposeAll(int step) {
    for (NoteSlot& slot : context_.NoteSlots) {
        int note = LenientNumber(slot.MidiNoteNumber) + step;
        if (note < 0) note = 127;
        if (note > 127) note = 0;
        SetField(slot.MidiNoteNumber, NumberText(note));
        if (slot.NoteFunction == QLatin1String("0")) {
            SetField(slot.Description, names_.GetMidiInfoText(note, slot));
        }
    }
    context_.GlobalTranspose += step;
}

void GlobalMidiCommands::ChangeAllVelocities(int step) {
    for (NoteSlot& slot : context_.NoteSlots) {
        const int velocity = std::clamp(LenientNumber(slot.MidiVelocity) + step, 0, 127);
        SetField(slot.MidiVelocity, NumberText(velocity));
    }
}

// Only a real change marks the arrangement as needing a save: velocities already at the end
// of their range stay as they are.
void GlobalMidiCommands::SetField(QString& field, const QString& value) {
    if (field == value) return;
    field = value;
    context_.FileChanged = true;
}

QStringList GlobalMidiCommands::PadLabels(QString NoteSlot::*field) const {
    QStringList labels;
    for (int note = kFirstPad; note <= kLastPad; ++note) labels << context_.NoteSlots[note].*field;
    return labels;
}
