// Sound through real servers: the JACK dummy driver and a PulseAudio null sink, as the test
// scripts and CI start them. A pad plays a 1 kHz sine at -6 dBFS through the engine; a second
// stream records what came out and the level must arrive within 1 dB on each side. The pad is
// panned so that a swap of the sides shows.
#include "components/audio/audio_engine.h"
#include "components/audio/devices/audio_api.h"
#include "components/audio/devices/rtaudio_input_device.h"
#include "components/servers/jack_probe.h"
#include "components/servers/pulse_probe.h"
#include "components/settings/memory_settings_store.h"
#include "engine/note_slots.h"
#include "support/sound_servers.h"
#include "support/wave_files.h"

#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <numbers>
#include <vector>

namespace {

constexpr double kSineDb = -6.0206;  // amplitude 0.5
constexpr int kPan = -600;           // the right side 6 dB down

// Keeps what a stream recorded, up to a fixed length, without allocating on the audio thread.
struct Recording : AudioCaptureSink {
    std::vector<float> samples = std::vector<float>(48000 * 2 * 20);
    std::atomic<std::size_t> written{0};
    std::atomic<int> channels{1};

    void capture(const float* in, int frames, int inChannels) noexcept override {
        channels.store(inChannels, std::memory_order_relaxed);
        const std::size_t at = written.load(std::memory_order_relaxed);
        const std::size_t count =
            std::min(static_cast<std::size_t>(frames) * inChannels, samples.size() - at);
        std::copy(in, in + count, samples.begin() + static_cast<std::ptrdiff_t>(at));
        written.store(at + count, std::memory_order_release);
    }
    // Each channel's level in dB of full scale, read as a sine's peak, over `frames` frames from
    // 0.1 s after the first loud sample (connections are made one port at a time); empty until
    // that much has come in.
    std::vector<double> levels(int frames) const {
        const std::size_t have = written.load(std::memory_order_acquire);
        const std::size_t n = static_cast<std::size_t>(channels.load());
        std::size_t first = 0;
        while (first < have && std::abs(samples[first]) < 0.05f) ++first;
        const std::size_t start = (first / n + 4800) * n;
        if (have < start + static_cast<std::size_t>(frames) * n) return {};
        std::vector<double> result(n);
        for (std::size_t c = 0; c < n; ++c) {
            double sum = 0.0;
            for (int i = 0; i < frames; ++i) sum += std::pow(samples[start + i * n + c], 2);
            result[c] = 10.0 * std::log10(2.0 * sum / frames);
        }
        return result;
    }
};

// Plays the sine on pad 60 through the engine's output on `api` and records it from the input
// device `source` of the same API.
void ExpectSineArrives(AudioApi api, const QString& source) {
    QTemporaryDir dir;
    const QString path = dir.filePath("sine.wav");
    ASSERT_TRUE(WriteTestWave(path, 48000, 1, 48000, [](long f, int) {
        return static_cast<float>(0.5 * std::sin(2 * std::numbers::pi * 1000.0 * f / 48000));
    }));

    MemorySettingsStore settings;
    settings.setValue("Audio", "Api", AudioApiText(api));
    AudioEngine engine(settings);
    QSignalSpy notices(&engine, &AudioEngine::statusNotice);
    ASSERT_TRUE(engine.start()) << notices.value(0).value(0).toString().toStdString();
    const AudioStreamFormat format = engine.outputDevice()->format();
    EXPECT_EQ(engine.mixer().deviceRate(), format.sampleRate);
    EXPECT_EQ(engine.outputDescription(), DescribeStream(api, format));
    MixerWaveChannel& pad = engine.channels().channel(60);
    ASSERT_TRUE(pad.setFileName(path)) << pad.lastError().toStdString();
    pad.setLooping(true);
    pad.setPan(kPan);
    ASSERT_TRUE(pad.start());

    Recording recording;  // outlives the stream that writes it
    RtAudioInputDevice input(api, source, 2);
    ASSERT_TRUE(input.start(recording)) << input.errorText().toStdString();
    std::vector<double> levels;
    ASSERT_TRUE(QTest::qWaitFor(
        [&] { return !(levels = recording.levels(input.format().sampleRate / 2)).empty(); }, 15000))
        << "nothing arrived on the recording stream";
    ASSERT_EQ(levels.size(), 2u);
    EXPECT_NEAR(levels[0], kSineDb, 1.0);
    EXPECT_NEAR(levels[1], kSineDb + kPan / 100.0, 1.0);
}

}  // namespace

TEST(AudioDeviceServers, PadPlaysThroughJackAtTheServersRateAndArrivesAtItsLevel) {
    REQUIRE_SOUND_SERVER(JackServerRunning(), "JACK");
    EXPECT_TRUE(AudioOutputDeviceNames(AudioApi::Jack).contains("system"));
    // Recording from the program's own output client connects its ports to the recording ones.
    ExpectSineArrives(AudioApi::Jack, "Orvelle Quindara Audio Out");
}

TEST(AudioDeviceServers, PadPlaysIntoThePulseNullSinkAndItsMonitorRecordsIt) {
    REQUIRE_SOUND_SERVER(PulseServerAnswers(), "PulseAudio");
    // PulseAudio lists the sink's monitor source by its description.
    const QStringList sources = AudioInputDeviceNames(AudioApi::Pulse);
    QString monitor;
    for (const QString& name : sources) {
        if (name.contains("Monitor", Qt::CaseInsensitive)) monitor = name;
    }
    ASSERT_FALSE(monitor.isEmpty()) << sources.join(", ").toStdString();
    ExpectSineArrives(AudioApi::Pulse, monitor);
}
