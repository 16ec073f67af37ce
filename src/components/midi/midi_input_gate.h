#pragma once

// What a file dialog needs of MIDI In: to drop what arrives for a while, as if the port were
// closed, while the port and every connection made to it stay. The calls nest.
class MidiInputGate {
  public:
    virtual ~MidiInputGate() = default;
    virtual void BeginDiscarding() = 0;
    virtual void EndDiscarding() = 0;
};
