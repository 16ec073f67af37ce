// Sound through real servers: the JACK dummy driver and a PulseAudio null sink, as the test
// scripts and CI start them. A pad plays a 1 kHz sine at -6 dBFS through the engine; a second
// stream records what came out and the level must arrive within 1 dB on each side. The pad is
// panned so that a swap of the sides shows.
#include "components/audio/audio_api.h"
#include "components/audio/audio_engine.h"
#include "components/audio/pulse_probe.h"
#include "components/audio/rtaudio_input_device.h"
#include "components/midi/jack_probe.h"
#include "components/settings/memory_settings_store.h"
#include "engine/note_slots.h"

#include <QSignalSpy>
#include <QTemporaryDir>

#include <gtest/gtest.h>
#include <sndfile.h>

#include <atomic>
#include <chrono>
#include <cmath>
#include <numbers>
#include <thread>
#include <vector>

namespace {

constexpr double kSineDb = -6.0206;  // amplitude 0.5
constexpr int kPan = -600;           // the right side 6 dB down

// Skips without the server, except on CI, which starts one.
#define REQUIRE_SOUND_SERVER(available, name)                                                     \
    do {                                                                                          \
        if (!(available)) {                                                                       \
            if (qgetenv("CI") == "true") FAIL() << "CI runs a " name " server, but none answers"; \
            GTEST_SKIP() << "no " name                                                            \
                            " server (source scripts/sound-servers.sh and run "                   \
                            "start_sound_servers)";                                               \
        }                                                                                         \
    } while (false)

bool WriteSine(const QString& path, int rate, double hertz, double amplitude, int frames) {
    SF_INFO info{};
    info.samplerate = rate;
    info.channels = 1;
    info.format = SF_FORMAT_WAV | SF_FORMAT_FLOAT;
    SNDFILE* file = sf_open(path.toLocal8Bit().constData(), SFM_WRITE, &info);
    if (!file) return false;
    std::vector<float> samples(static_cast<std::size_t>(frames));
    for (int i = 0; i < frames; ++i) {
        samples[i] =
            static_cast<float>(amplitude * std::sin(2 * std::numbers::pi * hertz * i / rate));
    }
    const sf_count_t written = sf_writef_float(file, samples.data(), frames);
    sf_close(file);
    return written == frames;
}

// Keeps what a stream recorded, up to a fixed length, without allocating on the audio thread.
class Recording : public AudioCaptureSink {
  public:
    explicit Recording(std::size_t maxSamples) : samples_(maxSamples) {}

    void capture(const float* samples, int frames, int channels) noexcept override {
        channels_.store(channels, std::memory_order_relaxed);
        const std::size_t at = written_.load(std::memory_order_relaxed);
        const std::size_t count =
            std::min(static_cast<std::size_t>(frames) * channels, samples_.size() - at);
        std::copy(samples, samples + count, samples_.begin() + static_cast<std::ptrdiff_t>(at));
        written_.store(at + count, std::memory_order_release);
    }

    // Waits until `frames` frames have come in after the first loud sample; false at the
    // deadline. Then level() measures those frames.
    bool waitForSound(int frames, std::chrono::seconds timeout) {
        const auto deadline = std::chrono::steady_clock::now() + timeout;
        while (std::chrono::steady_clock::now() < deadline) {
            const std::size_t written = written_.load(std::memory_order_acquire);
            const int channels = std::max(channels_.load(), 1);
            std::size_t first = 0;
            while (first < written && std::abs(samples_[first]) < 0.05f) ++first;
            // A little settling time after the sound arrives: connections are made one port
            // at a time.
            start_ = (first / channels + 4800) * channels;
            if (written >= start_ + static_cast<std::size_t>(frames) * channels) {
                frames_ = frames;
                return true;
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
        return false;
    }

    // The level of one channel in dB relative to full scale, read as a sine's peak.
    double level(int channel) const {
        const int channels = channels_.load();
        double sum = 0.0;
        for (int i = 0; i < frames_; ++i) {
            const double sample =
                samples_[start_ + static_cast<std::size_t>(i) * channels + channel];
            sum += sample * sample;
        }
        return 20.0 * std::log10(std::sqrt(2.0 * sum / frames_));
    }

  private:
    std::vector<float> samples_;
    std::atomic<std::size_t> written_{0};
    std::atomic<int> channels_{0};
    std::size_t start_ = 0;
    int frames_ = 0;
};

// Plays the sine on pad 60 through the engine's output on `api` and records it from the input
// device `source` of the same API.
void ExpectSineArrives(AudioApi api, const QString& source) {
    QTemporaryDir dir;
    ASSERT_TRUE(dir.isValid());
    const QString path = dir.filePath("sine.wav");
    ASSERT_TRUE(WriteSine(path, 48000, 1000.0, 0.5, 48000));

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

    Recording recording(48000 * 2 * 20);  // outlives the stream that writes it
    RtAudioInputDevice input(api, source, 2);
    ASSERT_TRUE(input.start(recording)) << input.errorText().toStdString();
    EXPECT_EQ(input.format().channels, 2);
    ASSERT_TRUE(recording.waitForSound(input.format().sampleRate / 2, std::chrono::seconds(15)))
        << "nothing arrived on the recording stream";
    EXPECT_NEAR(recording.level(0), kSineDb, 1.0);
    EXPECT_NEAR(recording.level(1), kSineDb + kPan / 100.0, 1.0);
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
