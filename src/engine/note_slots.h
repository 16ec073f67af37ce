#pragma once

#include "base/pads.h"

#include <QString>

#include <array>

class GmNames;
class SettingsStore;
class WaveChannels;

// What one MIDI note does. Every field is text, numbers in decimal and Booleans as
// "True"/"False", because that is how setup files store them.
struct NoteSlot {
    QString NoteFunction;  // "0" sends a MIDI note, "1" plays the wave sound
    QString Description;
    QString MidiNoteNumber;
    QString MidiChannel;  // 0-based; "9" is percussion
    QString MidiVelocity;
    QString MidiPatch;
    QString MidiBank;
    QString MidiPan;
    QString WaveVolume;     // hundredths of a decibel, -5000..0
    QString WavePan;        // -10000..10000
    QString WaveFrequency;  // Hz, 0 = the file's own rate
    QString WaveLooped;
    QString WavePlayMode;  // "0" once, "1" once without retrigger, "2" hold, "3" toggle
    QString WaveHoldToPlay;
    QString WaveToggleOnOff;
    QString WaveFileName;
    QString WaveAssigned;
    QString WavePlaying;
    QString Reserved1;
    QString Reserved2;
    QString Reserved3;

    bool operator==(const NoteSlot&) const = default;
};

using NoteSlotTable = std::array<NoteSlot, kSlotCount>;

// The values several windows share: the slot table, the device choices, the stored defaults and
// the arrangement's state. main() makes one and hands it to every part by reference.
struct Context {
    NoteSlotTable NoteSlots;

    bool MidiInAvailable = false;
    bool MidiOutAvailable = false;
    int MidiInDevice = 0;
    int MidiOutDevice = 0;
    int MidiDeviceNamesLength = 0;

    int DefaultMidiChannel = 0;
    int DefaultMidiBank = 0;
    int DefaultMidiVelocity = 127;
    int DefaultMidiPatch = 0;
    int MidiMainVolume = 100;
    int DefaultMetronomeNote = 37;
    int MetronomeVelocity = 120;
    QString MetronomeSound = QStringLiteral("True");

    int GlobalTranspose = 0;
    std::array<int, kPadCount> QwertyKeyState{};
    bool Recording = false;
    bool Playing = false;
    QString CurrentFileName;
    int CurrentSlot = kFirstPad;
    bool SlotsEdited = false;
    bool FileChanged = false;
    std::array<bool, 8> RecordingUnsaved{};
    int RecordingIndex = 0;
    QString CurrentTakeFile;
};

// Resets all 128 slots to the defaults, then releases whatever wave each pad's channel holds.
void InitializeAllMidiNotes(Context& context, const GmNames& names, WaveChannels& channels);

// Resets one slot; its WaveVolume, WavePlaying and Reserved2 and the pad's channel stay as they
// are.
void SetDefaultMidiNote(Context& context, int slot, const GmNames& names);

// Reads the "Defaults" section of the settings into the default values.
void GetStartupDefaults(Context& context, const SettingsStore& settings);
