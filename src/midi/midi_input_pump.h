#pragma once

#include "midi/midi_setup.h"

#include <QObject>

class InputDispatcher;
class MidiInputPort;

// Drains the MIDI In queue whenever the port says messages are waiting: messages about the pads
// go to the dispatcher, and plain note-ons and note-offs on the first channel move the keys.
class MidiInputPump : public QObject {
    Q_OBJECT
  public:
    MidiInputPump(MidiInputPort& midiIn, InputDispatcher& dispatcher, KeyDisplayFunction showKey,
                  QObject* parent = nullptr);

    void Pump();

  private:
    void Handle(int status, int data1, int data2);

    MidiInputPort& midiIn_;
    InputDispatcher& dispatcher_;
    KeyDisplayFunction showKey_;
    bool pumping_ = false;
};
