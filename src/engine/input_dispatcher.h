#pragma once

class GmNames;
class MidiOutputPort;
class WavePlayback;
struct Context;

// The one entry for note events: MIDI In, computer keys, on-screen keys and the note picker's
// audition all arrive here as a MIDI-style status byte, a note and a velocity.
class InputDispatcher {
  public:
    InputDispatcher(Context& context, MidiOutputPort& midiOut, WavePlayback& waves)
        : context_(context), midiOut_(midiOut), waves_(waves) {}

    // status: 128..143 note-off, 144..159 note-on, anything else passes through the slot's rules.
    // note: the slot 0..127 (others are ignored); velocity 0..127.
    void ProcessInputData(int status, int note, int velocity);

  private:
    void SendMidiNote(int note, int velocity);
    void PlayWaveSound(int note, int velocity);

    Context& context_;
    MidiOutputPort& midiOut_;
    WavePlayback& waves_;
};
