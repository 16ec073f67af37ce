#pragma once

#include "components/midi/midi_input_gate.h"
#include "midi/midi_setup.h"

#include <QObject>

class InputDispatcher;
class MidiInputPort;

// Drains the MIDI In queue whenever the port says messages are waiting: note and controller
// messages about the pads go to the dispatcher, and plain note-ons and note-offs on the first
// channel move the keys. It keeps draining while a message box is open, whoever opened it.
class MidiInputPump : public QObject, public MidiInputGate {
    Q_OBJECT
  public:
    MidiInputPump(MidiInputPort& midiIn, InputDispatcher& dispatcher, KeyDisplayFunction showKey,
                  QObject* parent = nullptr);

    void Pump();

    void BeginDiscarding() override { ++discarding_; }
    void EndDiscarding() override;

  private:
    void Handle(int status, int data1, int data2);

    MidiInputPort& midiIn_;
    InputDispatcher& dispatcher_;
    KeyDisplayFunction showKey_;
    int discarding_ = 0;
};
