#pragma once

#include "components/midi/midi_system.h"

#include <QString>

#include <functional>

class MidiInputPort;
class MidiOutputPort;
struct Context;

// The key in the settings group "MIDI" that names the MIDI system (MidiSystemText).
inline const QString kMidiSystemKey = QStringLiteral("MIDI_System");

// Shows a short notice in the main window's status bar; "" takes it away.
using StatusTextFunction = std::function<void(const QString& text)>;
// Shows the on-screen key of a pad note (57..72) pressed or raised.
using KeyDisplayFunction = std::function<void(int note, bool pressed)>;

// The program's MIDI port operations: device checks, the device fingerprint, opening and
// closing the two ports, the all-notes-off sweep and the main-volume message. Device indices
// and availability live in the Context, where the setup dialog and start-up find them.
class MidiSetup {
  public:
    MidiSetup(Context& context, MidiInputPort& midiIn, MidiOutputPort& midiOut,
              StatusTextFunction showStatus, KeyDisplayFunction showKey);

    // The MIDI system both ports go through: a change closes them and makes their clients anew,
    // so the device lists are the new system's. The caller opens the ports again.
    void UseMidiSystem(MidiSystem system);
    MidiSystem midiSystem() const { return system_; }

    void CheckMidiDevices();
    // Adds the name lengths of every In device, then every Out device, to
    // MidiDeviceNamesLength. The caller resets it first.
    void VerifyMidiDevices();

    // Opens the chosen device. A missing device, or a stored index that no longer names one,
    // leaves the port closed and says so in the status bar; a later success takes that back.
    void OpenMidiInPort();
    void OpenMidiOutPort();
    void CloseMidiInPort();
    void CloseMidiOutPort();

    // A note-on with velocity 0 for every note on every channel, then all pad keys raised.
    void AllMidiNotesOff();
    // Controller 7 with MidiMainVolume on the default channel.
    void SetMidiMainVolume();

    MidiInputPort& midiIn() { return midiIn_; }
    MidiOutputPort& midiOut() { return midiOut_; }

  private:
    void Send(int status, int data1, int data2);
    void ShowStatus(const QString& text);
    void TakeBackStatus(const QString& notice);

    Context& context_;
    MidiInputPort& midiIn_;
    MidiOutputPort& midiOut_;
    StatusTextFunction showStatus_;
    KeyDisplayFunction showKey_;
    MidiSystem system_ = MidiSystem::Automatic;
    QString shownStatus_;
};
