#pragma once

#include <functional>

class MidiSetup;
class Prompts;
class SettingsStore;
struct Context;

enum class StartupMidiOutcome {
    PortsOpened,       // the devices are the ones stored: both ports were opened
    SetupDialogShown,  // first run or a changed set of devices: the user was asked to choose
};

// The MIDI part of start-up: takes the MIDI system stored under "MIDI_System", reports missing In
// or Out devices, then opens the stored devices if the device fingerprint still matches the stored
// one, or else asks the user to pick devices in the setup dialog (which opens the ports on its OK).
StartupMidiOutcome RunStartupMidiCheck(MidiSetup& midiSetup, Context& context,
                                       const SettingsStore& settings, Prompts& prompts,
                                       const std::function<void()>& showMidiSetupDialog);
