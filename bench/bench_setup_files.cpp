// Saving and opening a setup file whose sixteen pads all play wave files.
#include "base/text_values.h"
#include "components/audio/playback/recording_wave_channels.h"
#include "setup_files/setup_file.h"

#include <benchmark/benchmark.h>

#include <QTemporaryDir>

namespace {

// A table as a performer keeps it: MIDI sounds on every note and a wave file on every pad.
NoteSlotTable PerformanceTable() {
    NoteSlotTable table;
    for (int note = 0; note < kSlotCount; ++note) {
        NoteSlot& slot = table[note];
        slot = NoteSlot{
            .NoteFunction = QStringLiteral("0"),
            .Description = QStringLiteral("MIDI Note C %1  Acoustic Grand Piano").arg(note),
            .MidiNoteNumber = NumberText(note),
            .MidiChannel = QStringLiteral("0"),
            .MidiVelocity = QStringLiteral("127"),
            .MidiPatch = QStringLiteral("0"),
            .MidiBank = QStringLiteral("0"),
            .MidiPan = QStringLiteral("63"),
            .WaveVolume = QStringLiteral("0"),
            .WavePan = QStringLiteral("0"),
            .WaveFrequency = QStringLiteral("0"),
            .WaveLooped = BooleanText(false),
            .WavePlayMode = QStringLiteral("0"),
            .WaveHoldToPlay = BooleanText(false),
            .WaveToggleOnOff = BooleanText(false),
            .WaveFileName = QString(),
            .WaveAssigned = BooleanText(false),
            .WavePlaying = BooleanText(false),
            .Reserved1 = QString(),
            .Reserved2 = QStringLiteral("0"),
            .Reserved3 = QStringLiteral("0")};
        if (IsPad(note)) {
            slot.NoteFunction = QStringLiteral("1");
            slot.WaveFileName =
                QStringLiteral("/home/player/Samples/Kit %1/pad %2.wav").arg(note / 4).arg(note);
            slot.Description = QStringLiteral("pad %1.wav  44100 Hz  16 bit  Stereo").arg(note);
            slot.WaveAssigned = BooleanText(true);
            slot.WaveVolume = QStringLiteral("-1200");
        }
    }
    return table;
}

void setup_save_us(benchmark::State& state) {
    const QTemporaryDir folder;
    const QString path = folder.filePath(QStringLiteral("bench.set"));
    const NoteSlotTable table = PerformanceTable();
    for (auto _ : state) {
        if (!SaveSetupFile(table, path).ok()) state.SkipWithError("save failed");
    }
}
BENCHMARK(setup_save_us)->Unit(benchmark::kMicrosecond);

void setup_open_us(benchmark::State& state) {
    const QTemporaryDir folder;
    const QString path = folder.filePath(QStringLiteral("bench.set"));
    if (!SaveSetupFile(PerformanceTable(), path).ok()) state.SkipWithError("save failed");
    Context context;
    RecordingWaveChannels channels;  // no audio is decoded, so only the file work is timed
    for (auto _ : state) {
        channels.log.clear();
        if (!OpenSetupFile(context, channels, path).ok()) state.SkipWithError("open failed");
    }
}
BENCHMARK(setup_open_us)->Unit(benchmark::kMicrosecond);

}  // namespace
