// One note-on of a MIDI slot through the dispatcher into the loopback MIDI Out port: four
// messages built from the slot's text on every call.
#include "components/audio/playback/recording_wave_channels.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "engine/gm_names.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"
#include "engine/wave_playback.h"

#include <benchmark/benchmark.h>

static void dispatch_ns(benchmark::State& state) {
    Context context;
    ScriptedPrompts prompts;
    GmNames names(GmNames::Installed(prompts));
    RecordingWaveChannels channels;
    InitializeAllMidiNotes(context, names, channels);
    LoopbackMidiOutput midiOut({QStringLiteral("Loopback Out")});
    midiOut.open(0);
    midiOut.sent.reserve(1 << 16);
    WavePlayback waves(context, channels, prompts);
    InputDispatcher dispatcher(context, midiOut, waves);

    for (auto _ : state) {
        dispatcher.ProcessInputData(144, 60, 100);
        if (midiOut.sent.size() >= (1 << 16) - 4) midiOut.sent.clear();  // keeps capacity
    }
}
BENCHMARK(dispatch_ns);
