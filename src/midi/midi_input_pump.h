#pragma once

#include "midi/midi_setup.h"

#include <QObject>

class InputDispatcher;
class MidiInputPort;

// Drains the MIDI In queue whenever the port says messages are waiting: note and controller
// messages about the pads go to the dispatcher, and plain note-ons and note-offs on the first
// channel move the keys. It keeps draining while a message box is open, whoever opened it.
class MidiInputPump : public QObject {
    Q_OBJECT
  public:
    MidiInputPump(MidiInputPort& midiIn, InputDispatcher& dispatcher, KeyDisplayFunction showKey,
                  QObject* parent = nullptr);

    void Pump();

    // While a file dialog is open, incoming messages are taken off the queue and dropped, as if
    // the port were closed, but the port and every connection made to it stay. Nests.
    void BeginDiscarding() { ++discarding_; }
    void EndDiscarding();

  private:
    void Handle(int status, int data1, int data2);

    MidiInputPort& midiIn_;
    InputDispatcher& dispatcher_;
    KeyDisplayFunction showKey_;
    int discarding_ = 0;
};
