#pragma once

#include "components/audio/playback/recording_wave_channels.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"
#include "engine/wave_playback.h"
#include "midi/midi_setup.h"

#include <gtest/gtest.h>

#include <functional>
#include <ostream>
#include <vector>

inline void PrintTo(const ShortMessage& message, std::ostream* out) {
    *out << '(' << int(message.status) << ", " << int(message.data1) << ", " << int(message.data2)
         << ')';
}

// Scripted prompts that can run something while a box is up, as a modal box's event loop does.
struct ModalPrompts : ScriptedPrompts {
    std::function<void()> whileShown;
    PromptButton message(const MessagePrompt& prompt) override {
        if (whileShown) whileShown();
        return ScriptedPrompts::message(prompt);
    }
};

// One key display change: the pad note and whether it was shown pressed.
struct KeyShown {
    int note;
    bool pressed;
    bool operator==(const KeyShown&) const = default;
};

inline void PrintTo(const KeyShown& key, std::ostream* out) {
    *out << key.note << (key.pressed ? " pressed" : " raised");
}

// The MIDI operations over loopback ports, with the real dispatcher and wave playback behind
// them, and a record of the status texts and key changes they show.
struct MidiTest : ::testing::Test {
    Context context;
    ModalPrompts prompts;
    RecordingWaveChannels channels;
    LoopbackMidiInput midiIn;
    LoopbackMidiOutput midiOut;
    WavePlayback waves{context, channels, prompts};
    InputDispatcher dispatcher{context, midiOut, waves};

    QStringList statusTexts;
    std::vector<KeyShown> keys;
    MidiSetup setup{context, midiIn, midiOut,
                    [this](const QString& text) { statusTexts.append(text); },
                    [this](int note, bool pressed) {
                        keys.push_back({note, pressed});
                    }};

    // A MIDI slot on channel 3 with bank 2, patch 5, pan 63, note 60 and velocity 100.
    NoteSlot& MakeMidiSlot(int note) {
        NoteSlot& slot = context.NoteSlots[note];
        slot.NoteFunction = "0";
        slot.MidiChannel = "3";
        slot.MidiBank = "2";
        slot.MidiPatch = "5";
        slot.MidiPan = "63";
        slot.MidiNoteNumber = "60";
        slot.MidiVelocity = "100";
        return slot;
    }

    // A wave pad that sounds while held.
    NoteSlot& MakeHeldWavePad(int note) {
        NoteSlot& slot = context.NoteSlots[note];
        slot.NoteFunction = "1";
        slot.WavePlayMode = "2";
        slot.WaveLooped = "True";
        slot.WaveFileName = "/sounds/pad.wav";
        slot.WaveAssigned = "True";
        slot.WaveFrequency = "0";
        slot.WaveVolume = "0";
        slot.WavePan = "0";
        slot.WavePlaying = "False";
        return slot;
    }
};

inline const std::vector<ShortMessage> kSlotNoteOn{
    {179, 0, 2}, {195, 5, 0}, {179, 10, 63}, {147, 60, 100}};
inline const ShortMessage kSlotNoteOff{147, 60, 0};
