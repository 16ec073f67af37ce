#pragma once

#include <QString>

#include <array>

// The MIDI systems the ports can go through. Automatic takes JACK when its server runs, else the
// ALSA sequencer, the same rule as for sound.
enum class MidiSystem { Automatic, Jack, Alsa };

// What the MIDI setup dialog offers, in the order it lists them.
inline constexpr std::array kMidiSystemChoices{MidiSystem::Automatic, MidiSystem::Jack,
                                               MidiSystem::Alsa};

// The settings text under "MIDI"/"MIDI_System": "JACK" or "ALSA"; anything else is Automatic ("").
MidiSystem MidiSystemFromText(const QString& text);
QString MidiSystemText(MidiSystem system);
// The name the dialog shows: the settings text, and "Automatic" for the first that is there.
QString MidiSystemChoiceName(MidiSystem system);

// True when the system can be used now. Asks JACK without starting a server.
bool MidiSystemPresent(MidiSystem system);
// Automatic becomes the system to use now; the others stay as they are.
MidiSystem ResolveMidiSystem(MidiSystem system);
// Which system Automatic uses now, or why a chosen one cannot be used ("no JACK server runs").
QString MidiSystemNote(MidiSystem system);
