#pragma once

#include "components/midi/midi_system.h"

#include <QString>
#include <QStringList>

class MidiSetup;
class SettingsStore;
struct Context;

// What the MIDI setup dialog lists: the device names in the order the ports number them, and the
// entries to select (-1 for none).
struct MidiDeviceLists {
    QStringList inNames;
    QStringList outNames;
    int inSelection = -1;
    int outSelection = -1;
};

// The names of every In device, then every Out device, with MidiDeviceNamesLength recomputed
// from exactly these names. The current devices are selected; a stored index that no longer
// names a device selects the first one, so OK always offers a device that exists.
MidiDeviceLists FillMidiDeviceLists(MidiSetup& midiSetup, Context& context);

// The work behind the MIDI setup dialog, from its loading to OK or Cancel, on the program's own
// ports. It keeps only what Cancel needs to undo a test note or a change of MIDI system.
class MidiSetupSession {
  public:
    MidiSetupSession(Context& context, MidiSetup& midiSetup, SettingsStore& settings);
    // A test note still sounding is ended, so no note hangs on the synthesizer.
    ~MidiSetupSession();
    MidiSetupSession(const MidiSetupSession&) = delete;
    MidiSetupSession& operator=(const MidiSetupSession&) = delete;

    // CheckMidiDevices, then FillMidiDeviceLists.
    MidiDeviceLists Load();
    // Notes the MIDI system and the devices the ports are open on now; Cancel returns to them.
    void RememberPorts();
    // Another MIDI system chosen: both ports move to it, closed, and its devices are listed.
    MidiDeviceLists ChangeSystem(MidiSystem system);
    MidiSystem midiSystem() const;

    // Test MIDI Out pressed: middle C at velocity 100 on channel 1 of the Out device at
    // `outPosition`. Released: the note's end, and the port closed.
    void StartTestNote(int outPosition);
    void EndTestNote();
    bool testNoteSounding() const { return testNoteSounding_; }

    // OK: the list positions (-1 for an empty list), their names and the MIDI system are stored
    // and both ports opened on them.
    void Accept(int inPosition, const QString& inName, int outPosition, const QString& outName);
    // Cancel stores nothing; the ports go back to the system and devices remembered, as a test
    // note or another system would otherwise leave every MIDI slot silent.
    void Cancel();

  private:
    Context& context_;
    MidiSetup& midiSetup_;
    SettingsStore& settings_;
    MidiSystem systemBefore_ = MidiSystem::Automatic;
    QString inDeviceBefore_;  // "" when the In port was closed
    QString outDeviceBefore_;
    bool testNoteSounding_ = false;
};
