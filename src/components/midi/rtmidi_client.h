#pragma once

#include "components/midi/midi_port.h"
#include "components/midi/midi_system.h"

#include <QList>
#include <QString>

#include <memory>
#include <string>

class RtMidi;
class RtMidiIn;
class RtMidiOut;

// The client names the program's two ports go by in the MIDI system.
inline constexpr char kOwnInputClientName[] = "Orvelle Quindara MIDI In";
inline constexpr char kOwnOutputClientName[] = "Orvelle Quindara MIDI Out";

// An RtMidi client on the MIDI system: Automatic takes a running JACK server, else the ALSA
// sequencer. nullptr when the system is not there. Never starts a server and never throws.
// Made for RtMidiIn and RtMidiOut.
template <class Client>
std::unique_ptr<Client> MakeRtMidiClient(MidiSystem system, const std::string& clientName);

// A port of another program, with the number RtMidi gives it right now.
struct ForeignPort {
    unsigned int number = 0;
    QString name;
};

// The ports RtMidi lists, less the program's own: with JACK our MIDI Out port is itself an input
// device to everyone else, and the lists must not change when our ports open or close.
QList<ForeignPort> ForeignPorts(RtMidi& midi);
bool IsOwnPort(const QString& portName);

// Makes RtMidi report its errors into the text instead of printing them and throwing.
void KeepErrorsIn(RtMidi& midi, std::string& lastError);

// Connects our port ownPortName to the device at deviceIndex of ForeignPorts(midi), looked up
// afresh so the index means the same device the user picked. "" on success, else the reason.
QString OpenForeignPort(RtMidi& midi, int deviceIndex, const std::string& ownPortName,
                        std::string& lastError);
void CloseQuietly(RtMidi* midi);

QString NoMidiSystemText();

// How many bytes the message takes on the wire; 0 when it is not a short message that can be
// sent (no status byte, a data byte with the top bit set, or the start of system exclusive).
int WireLength(const ShortMessage& message);
