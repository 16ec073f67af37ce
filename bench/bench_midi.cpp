// The MIDI figures: the all-notes-off sweep (2048 messages) into the loopback port, i.e. the
// program's own cost of the sweep without any MIDI system behind it.
#include "components/midi/loopback_midi.h"
#include "engine/note_slots.h"
#include "midi/midi_setup.h"

#include <benchmark/benchmark.h>

namespace {

void all_notes_off_us(benchmark::State& state) {
    Context context;
    LoopbackMidiInput midiIn;
    LoopbackMidiOutput midiOut({QStringLiteral("Loopback")});
    midiOut.open(0);
    midiOut.sent.reserve(2048);
    int keysShown = 0;
    MidiSetup setup(context, midiIn, midiOut, {}, [&](int, bool) { ++keysShown; });
    for (auto _ : state) {
        midiOut.sent.clear();  // keeps its capacity, so no iteration allocates
        setup.AllMidiNotesOff();
        benchmark::DoNotOptimize(midiOut.sent.data());
    }
    if (midiOut.sent.size() != 2048) state.SkipWithError("the sweep did not send 2048 messages");
    benchmark::DoNotOptimize(keysShown);
}
BENCHMARK(all_notes_off_us)->Unit(benchmark::kMicrosecond);

}  // namespace
