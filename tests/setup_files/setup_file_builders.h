#pragma once

#include "components/audio/recording_wave_channels.h"
#include "components/prompts/scripted_prompts.h"
#include "engine/note_slots.h"
#include "pickers/gm_names.h"

#include <QByteArray>
#include <QFile>
#include <QString>
#include <QtEndian>

// Tables and setup-file bytes made by hand for the setup-file tests.

inline constexpr int kEmptyFileSize = 21 * 128 * 2;

// The table as the program starts with it, all stored defaults missing.
inline NoteSlotTable FreshTable() {
    ScriptedPrompts prompts;
    const GmNames names(QStringLiteral("/nonexistent/genmidi.txt"),
                        QStringLiteral("/nonexistent/genmididrums.txt"), prompts);
    RecordingWaveChannels channels;
    Context context;
    InitializeAllMidiNotes(context, names, channels);
    return context.NoteSlots;
}

// Every field of every slot holds its own text, "WavePan 60" and so on, so that a value read
// into the wrong field or slot shows.
inline NoteSlotTable TaggedTable() {
    NoteSlotTable table;
    for (int k = 0; k < kSlotCount; ++k) {
        auto tag = [k](const char* field) { return QStringLiteral("%1 %2").arg(field).arg(k); };
        NoteSlot& slot = table[k];
        slot.NoteFunction = tag("NoteFunction");
        slot.Description = tag("Description");
        slot.MidiNoteNumber = tag("MidiNoteNumber");
        slot.MidiChannel = tag("MidiChannel");
        slot.MidiVelocity = tag("MidiVelocity");
        slot.MidiPatch = tag("MidiPatch");
        slot.MidiBank = tag("MidiBank");
        slot.MidiPan = tag("MidiPan");
        slot.WaveVolume = tag("WaveVolume");
        slot.WavePan = tag("WavePan");
        slot.WaveFrequency = tag("WaveFrequency");
        slot.WaveLooped = tag("WaveLooped");
        slot.WavePlayMode = tag("WavePlayMode");
        slot.WaveHoldToPlay = tag("WaveHoldToPlay");
        slot.WaveToggleOnOff = tag("WaveToggleOnOff");
        slot.WaveFileName = tag("WaveFileName");
        slot.WaveAssigned = tag("WaveAssigned");
        slot.WavePlaying = tag("WavePlaying");
        slot.Reserved1 = tag("Reserved1");
        slot.Reserved2 = tag("Reserved2");
        slot.Reserved3 = tag("Reserved3");
    }
    return table;
}

// One stored value: its 16-bit little-endian count, then the bytes.
inline QByteArray Entry(const QByteArray& text, qint16 count) {
    char word[2];
    qToLittleEndian<qint16>(count, word);
    return QByteArray(word, 2) + text;
}
inline QByteArray Entry(const QByteArray& text) {
    return Entry(text, qint16(text.size()));
}

// Where the count of a value starts in a file whose earlier values are all empty.
// Blocks are numbered from 1, slots from 0.
inline qsizetype EmptyEntryOffset(int block, int slot) {
    return ((block - 1) * 128 + slot) * 2;
}

// A setup file of empty values but one: `text` in the given block and slot.
inline QByteArray FileWithValue(int block, int slot, const QByteArray& text) {
    QByteArray bytes(kEmptyFileSize, '\0');
    const qsizetype at = EmptyEntryOffset(block, slot);
    return bytes.left(at) + Entry(text) + bytes.mid(at + 2);
}

inline bool WriteFile(const QString& path, const QByteArray& bytes) {
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

inline QByteArray ReadFile(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}
