#pragma once

#include "components/audio/playback/recording_wave_channels.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "components/settings/memory_settings_store.h"
#include "engine/gm_names.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"
#include "engine/wave_playback.h"

#include <gtest/gtest.h>

#include <vector>

// The real dispatcher and wave playback over the loopback MIDI port and recording channels,
// with a freshly reset table.
struct DispatchTest : ::testing::Test {
    Context context;
    ScriptedPrompts prompts;
    GmNames names{QStringLiteral(OQ_SOURCE_DATA_DIR "/genmidi.txt"),
                  QStringLiteral(OQ_SOURCE_DATA_DIR "/genmididrums.txt"), prompts};
    RecordingWaveChannels channels;
    LoopbackMidiOutput midiOut{{QStringLiteral("Loopback Out")}};
    WavePlayback waves{context, channels, prompts};
    InputDispatcher dispatcher{context, midiOut, waves};

    void SetUp() override {
        GetStartupDefaults(context, MemorySettingsStore());
        InitializeAllMidiNotes(context, names, channels);
        channels.log.clear();
        ASSERT_TRUE(midiOut.open(0));
    }

    // A pad that plays `file` in the given mode, with the switch's fields in agreement.
    NoteSlot& MakeWavePad(int note, const char* mode, const QString& file = "/sounds/hit.wav") {
        NoteSlot& slot = context.NoteSlots[note];
        const int m = QString::fromLatin1(mode).toInt();
        slot.NoteFunction = "1";
        slot.WavePlayMode = QString::fromLatin1(mode);
        slot.WaveLooped = m >= 2 ? "True" : "False";
        slot.WaveHoldToPlay = m == 2 ? "True" : "False";
        slot.WaveToggleOnOff = m == 3 ? "True" : "False";
        slot.WaveFileName = file;
        slot.WaveAssigned = "True";
        return slot;
    }

    int Starts(int note) const { return channels.log.count(QString::number(note) + " start"); }
    int Stops(int note) const { return channels.log.count(QString::number(note) + " stop"); }
    bool Sounding(int note) { return channels.channel(note).isPlaying(); }
    const QString& Playing(int note) const { return context.NoteSlots[note].WavePlaying; }

    // The note-ons ("60 on") and note-offs ("60 off") sent on channel 1, without the bank,
    // program and pan sent before each note.
    QStringList Notes() const {
        QStringList notes;
        for (const ShortMessage& m : midiOut.sent) {
            if (m.status == 144)
                notes << QStringLiteral("%1 %2").arg(m.data1).arg(m.data2 ? "on" : "off");
        }
        return notes;
    }
};

inline std::vector<ShortMessage> Messages(std::initializer_list<ShortMessage> list) {
    return list;
}
