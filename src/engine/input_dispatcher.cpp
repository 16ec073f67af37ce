#include "engine/input_dispatcher.h"

#include "base/text_values.h"
#include "components/midi/midi_port.h"
#include "engine/note_slots.h"
#include "engine/wave_playback.h"

#include <algorithm>

namespace {

bool IsNoteOff(int status) {
    return status >= 128 && status <= 143;
}
bool IsNoteMessage(int status) {
    return status >= 128 && status <= 159;
}

// A data byte from a slot's text; out-of-range text never turns into another kind of byte.
std::uint8_t DataByte(const QString& text) {
    return static_cast<std::uint8_t>(std::clamp(LenientNumber(text), 0, 127));
}

}  // namespace

void InputDispatcher::ProcessInputData(int status, int note, int velocity) {
    if (!IsSlot(note)) return;
    if (IsNoteOff(status)) velocity = 0;

    const QString& function = context_.NoteSlots[note].NoteFunction;
    if (function == QLatin1String("0")) {
        if (IsNoteMessage(status)) SendMidiNote(note, velocity);
    } else if (function == QLatin1String("1")) {
        PlayWaveSound(note, velocity);
    }
}

// Bank, program and pan go before every note-on, so the sound module is always set for the
// slot however other slots left it. The incoming velocity only tells note-on from note-off.
void InputDispatcher::SendMidiNote(int note, int velocity) {
    const NoteSlot& slot = context_.NoteSlots[note];
    const int channel = LenientNumber(slot.MidiChannel);
    if (channel < 0 || channel > 15) return;
    const auto controller = static_cast<std::uint8_t>(176 + channel);
    const auto noteOn = static_cast<std::uint8_t>(144 + channel);
    const std::uint8_t noteNumber = DataByte(slot.MidiNoteNumber);

    if (velocity == 0) {
        midiOut_.send({noteOn, noteNumber, 0});
        return;
    }
    midiOut_.send({controller, 0, DataByte(slot.MidiBank)});
    midiOut_.send({static_cast<std::uint8_t>(192 + channel), DataByte(slot.MidiPatch), 0});
    midiOut_.send({controller, 10, DataByte(slot.MidiPan)});
    midiOut_.send({noteOn, noteNumber, DataByte(slot.MidiVelocity)});
}

// The play mode decides; the status is not looked at, only whether the velocity is 0.
void InputDispatcher::PlayWaveSound(int note, int velocity) {
    NoteSlot& slot = context_.NoteSlots[note];
    const bool playing = slot.WavePlaying == QLatin1String("True");
    const QString& mode = slot.WavePlayMode;

    if (mode == QLatin1String("0")) {  // once, a new press starts it again
        if (velocity == 0) return;
        if (playing) {
            waves_.StopWave(note);
            slot.WavePlaying = BooleanText(false);
        }
        waves_.PlayWave(note);
    } else if (mode == QLatin1String("1")) {  // once, presses while it sounds are ignored
        // A note-off never starts a sound, even after the wave has ended by itself.
        if (velocity != 0 && !playing) waves_.PlayWave(note);
    } else if (mode == QLatin1String("2")) {  // looped while held
        if (velocity != 0) {
            waves_.PlayWave(note);
        } else {
            waves_.StopWave(note);
        }
    } else if (mode == QLatin1String("3")) {  // looped, each press toggles
        if (velocity == 0) return;
        if (!playing) {
            waves_.PlayWave(note);
            slot.WavePlaying = BooleanText(true);
        } else {
            waves_.StopWave(note);
            slot.WavePlaying = BooleanText(false);
        }
    }
}
