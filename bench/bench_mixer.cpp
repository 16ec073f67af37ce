// The mixer at work: sixteen pads sounding ten-second files at different rates and pans,
// against sox doing the same mix; and how soon a triggered pad is heard.
#include "components/audio/devices/offline_audio_device.h"
#include "components/audio/playback/engine_wave_channels.h"
#include "components/audio/playback/wave_mixer.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"
#include "engine/wave_playback.h"

#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>

#include <benchmark/benchmark.h>
#include <sndfile.h>

#include <cmath>
#include <ctime>
#include <vector>

namespace {

constexpr int kDeviceRate = 48000;
constexpr int kPeriod = 256;
constexpr int kFileRate = 44100;
constexpr int kFileSeconds = 10;

struct Pad {
    QString path;
    double speed;  // the pad's frequency as a multiple of the file's rate
    int volume;    // hundredths of a decibel
    int pan;
};

// Sixteen ten-second stereo files, written once per program run.
const std::vector<Pad>& Pads() {
    static QTemporaryDir dir;
    static std::vector<Pad> pads = [] {
        std::vector<Pad> made;
        for (int i = 0; i < 16; ++i) {
            Pad pad{dir.filePath(QStringLiteral("pad%1.wav").arg(i)), 0.8 + 0.027 * i, -150 * i,
                    -7500 + 1000 * i};
            SF_INFO info{};
            info.samplerate = kFileRate;
            info.channels = 2;
            info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
            SNDFILE* file = sf_open(QFile::encodeName(pad.path).constData(), SFM_WRITE, &info);
            const long frames = long{kFileRate} * kFileSeconds;
            std::vector<float> data(static_cast<std::size_t>(frames) * 2);
            for (long f = 0; f < frames; ++f) {
                const double t = static_cast<double>(f) / kFileRate;
                data[2 * f] = 0.2f * static_cast<float>(std::sin(2 * M_PI * (110 + 40 * i) * t));
                data[2 * f + 1] =
                    0.2f * static_cast<float>(std::sin(2 * M_PI * (165 + 40 * i) * t));
            }
            sf_writef_float(file, data.data(), frames);
            sf_close(file);
            made.push_back(pad);
        }
        return made;
    }();
    return pads;
}

double ThreadCpuSeconds() {
    timespec now{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

void StartAll(EngineWaveChannels& channels, bool looping) {
    const std::vector<Pad>& pads = Pads();
    for (int i = 0; i < 16; ++i) {
        MixerWaveChannel& channel = channels.channel(kFirstPad + i);
        channel.setFileName(pads[i].path);
        channel.setFrequency(static_cast<int>(std::lround(kFileRate * pads[i].speed)));
        channel.setLooping(looping);
        channel.setVolume(pads[i].volume);
        channel.setPan(pads[i].pan);
        channel.start();
    }
}

// Our side of the comparison: the whole mix, until every pad has ended, into a WAV file.
void MixIntoFile(const QString& path) {
    WaveMixer mixer(kDeviceRate);
    EngineWaveChannels channels(mixer);
    StartAll(channels, false);
    SF_INFO info{};
    info.samplerate = kDeviceRate;
    info.channels = 2;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SNDFILE* file = sf_open(QFile::encodeName(path).constData(), SFM_WRITE, &info);
    std::vector<float> period(2 * kPeriod);
    const long longest = static_cast<long>(kDeviceRate * kFileSeconds / 0.8) + kPeriod;
    for (long done = 0; done < longest; done += kPeriod) {
        mixer.render(period.data(), kPeriod);
        sf_writef_float(file, period.data(), kPeriod);
    }
    sf_close(file);
}

// The same mix by sox: each file changed in speed, panned and scaled, mixed and resampled.
bool SoxMixIntoFile(const QString& path) {
    QStringList arguments;
    for (const Pad& pad : Pads()) {
        float left = 1, right = 1;
        WaveMixer::Gains(pad.volume, pad.pan, left, right);
        arguments << QStringLiteral("-v") << QStringLiteral("1")
                  << QStringLiteral("|sox \"%1\" -p speed %2 remix 1v%3 2v%4")
                         .arg(pad.path)
                         .arg(pad.speed, 0, 'f', 4)
                         .arg(left, 0, 'f', 6)
                         .arg(right, 0, 'f', 6);
    }
    arguments.prepend(QStringLiteral("-m"));
    arguments << QStringLiteral("-b") << QStringLiteral("16") << path << QStringLiteral("rate")
              << QString::number(kDeviceRate);
    QProcess sox;
    sox.start(QStringLiteral("sox"), arguments);
    return sox.waitForFinished(600000) && sox.exitStatus() == QProcess::NormalExit &&
           sox.exitCode() == 0;
}

}  // namespace

static void mix16_realtime_factor(benchmark::State& state) {
    double audioSeconds = 0, cpuSeconds = 0;
    for (auto _ : state) {
        WaveMixer mixer(kDeviceRate);
        EngineWaveChannels channels(mixer);
        StartAll(channels, true);
        std::vector<float> period(2 * kPeriod);
        const int periods = kDeviceRate * kFileSeconds / kPeriod;
        const double before = ThreadCpuSeconds();
        for (int i = 0; i < periods; ++i) mixer.render(period.data(), kPeriod);
        cpuSeconds += ThreadCpuSeconds() - before;
        audioSeconds += static_cast<double>(periods) * kPeriod / kDeviceRate;
        benchmark::DoNotOptimize(period.data());
    }
    state.counters["mix16_realtime_factor"] = audioSeconds / cpuSeconds;
}
BENCHMARK(mix16_realtime_factor)->Unit(benchmark::kMillisecond)->Iterations(3);

static void mix16_vs_sox_speedup(benchmark::State& state) {
    if (QStandardPaths::findExecutable(QStringLiteral("sox")).isEmpty()) {
        state.SkipWithError("sox is not installed");
        return;
    }
    QTemporaryDir out;
    Pads();  // the files exist before either side is timed
    double ours = 0, theirs = 0;
    for (auto _ : state) {
        QElapsedTimer clock;
        clock.start();
        MixIntoFile(out.filePath(QStringLiteral("ours.wav")));
        ours += static_cast<double>(clock.nsecsElapsed());
        clock.restart();
        if (!SoxMixIntoFile(out.filePath(QStringLiteral("sox.wav")))) {
            state.SkipWithError("sox failed");
            return;
        }
        theirs += static_cast<double>(clock.nsecsElapsed());
    }
    state.counters["mix16_vs_sox_speedup"] = theirs / ours;
}
BENCHMARK(mix16_vs_sox_speedup)->Unit(benchmark::kMillisecond)->Iterations(1);

// Frames from ProcessInputData until the pad's first sample leaves the device: the frames
// rendered before it, its place in its period, and the period the device plays out first.
static void trigger_latency_frames(benchmark::State& state) {
    Context context;
    ScriptedPrompts prompts;
    WaveMixer mixer(kDeviceRate);
    EngineWaveChannels channels(mixer);
    OfflineAudioDevice device(AudioStreamFormat{kDeviceRate, kPeriod, 2});
    device.start(mixer);
    LoopbackMidiOutput midiOut;
    WavePlayback waves(context, channels, prompts);
    InputDispatcher dispatcher(context, midiOut, waves);
    // A hit that starts at full level, so its first frame is not silent by itself.
    QTemporaryDir dir;
    const QString hit = dir.filePath(QStringLiteral("hit.wav"));
    SF_INFO info{};
    info.samplerate = kFileRate;
    info.channels = 1;
    info.format = SF_FORMAT_WAV | SF_FORMAT_FLOAT;
    SNDFILE* file = sf_open(QFile::encodeName(hit).constData(), SFM_WRITE, &info);
    const std::vector<float> level(4410, 0.5f);
    sf_writef_float(file, level.data(), static_cast<sf_count_t>(level.size()));
    sf_close(file);
    NoteSlot& slot = context.NoteSlots[60];
    slot = NoteSlot{"1",     "",  "60",    "0",     "127", "0",    "0",     "63", "0", "0", "0",
                    "False", "0", "False", "False", hit,   "True", "False", "",   "0", "0"};
    double worst = 0;
    for (auto _ : state) {
        waves.AllWaveSoundsOff();
        device.pull(2);
        channels.collectEvents();
        dispatcher.ProcessInputData(144, 60, 100);
        long frames = kPeriod;  // the device's own buffering of one period
        for (bool heard = false; !heard;) {
            const std::vector<float>& period = device.pull();
            for (int i = 0; i < kPeriod && !heard; ++i) {
                if (period[2 * i] != 0.0f || period[2 * i + 1] != 0.0f) {
                    heard = true;
                    frames += i;
                }
            }
            if (!heard) frames += kPeriod;
        }
        worst = std::max(worst, static_cast<double>(frames));
    }
    state.counters["trigger_latency_frames"] = worst;
}
BENCHMARK(trigger_latency_frames)->Iterations(200);
