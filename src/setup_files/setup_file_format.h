#pragma once

#include "engine/note_slots.h"

#include <QByteArray>
#include <QString>

#include <array>
#include <optional>

// A setup file has no header: 21 blocks, one per slot field, each with the values of slots
// 0..127 in turn. A value is a signed 16-bit little-endian byte count and that many bytes of text.
struct SetupFileBlock {
    const char* fieldName;
    QString NoteSlot::*field;
};

// The order of the blocks; MidiPan is stored last, after the reserved fields, not in its place in
// NoteSlot.
inline constexpr std::array<SetupFileBlock, 21> kSetupFileBlocks{{
    {"NoteFunction", &NoteSlot::NoteFunction},
    {"Description", &NoteSlot::Description},
    {"MidiNoteNumber", &NoteSlot::MidiNoteNumber},
    {"MidiChannel", &NoteSlot::MidiChannel},
    {"MidiVelocity", &NoteSlot::MidiVelocity},
    {"MidiPatch", &NoteSlot::MidiPatch},
    {"MidiBank", &NoteSlot::MidiBank},
    {"WaveVolume", &NoteSlot::WaveVolume},
    {"WavePan", &NoteSlot::WavePan},
    {"WaveFrequency", &NoteSlot::WaveFrequency},
    {"WaveLooped", &NoteSlot::WaveLooped},
    {"WavePlayMode", &NoteSlot::WavePlayMode},
    {"WaveHoldToPlay", &NoteSlot::WaveHoldToPlay},
    {"WaveToggleOnOff", &NoteSlot::WaveToggleOnOff},
    {"WaveFileName", &NoteSlot::WaveFileName},
    {"WaveAssigned", &NoteSlot::WaveAssigned},
    {"WavePlaying", &NoteSlot::WavePlaying},
    {"Reserved1", &NoteSlot::Reserved1},
    {"Reserved2", &NoteSlot::Reserved2},
    {"Reserved3", &NoteSlot::Reserved3},
    {"MidiPan", &NoteSlot::MidiPan},
}};

// The most bytes one value can have: the largest count a signed 16-bit word holds.
inline constexpr int kLongestSetupValue = 32767;
// No setup file is longer; anything after that is not read.
inline constexpr qint64 kLongestSetupFile =
    qint64(kSetupFileBlocks.size()) * kSlotCount * (2 + kLongestSetupValue);

struct EncodedSetupFile {
    QByteArray bytes;  // the whole file, when problem is empty
    QString problem;   // why the table cannot be stored, e.g. a value that is too long
};

struct DecodedSetupFile {
    std::optional<NoteSlotTable> table;  // only a completely read table
    QString
        problem;  // what is wrong with the bytes: "it ends early in block 15 (WaveFileName), ..."
};

EncodedSetupFile EncodeSetupFile(const NoteSlotTable& table);
// Bytes after the last block are ignored.
DecodedSetupFile DecodeSetupFile(const QByteArray& bytes);
