#include "components/audio/devices/offline_audio_device.h"
#include "components/audio/playback/engine_wave_channels.h"
#include "components/audio/playback/wave_mixer.h"
#include "support/wave_files.h"

#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>
#include <new>

// The audio callback must never allocate or free: every operator new and delete made while the
// mixer renders is counted. libstdc++'s array forms call these.
namespace {
thread_local bool rendering = false;  // only ever set on the test's thread
int allocationsWhileRendering = 0;
int freesWhileRendering = 0;
}  // namespace

void* operator new(std::size_t size) {
    if (rendering) ++allocationsWhileRendering;
    if (void* p = std::malloc(size ? size : 1)) return p;
    throw std::bad_alloc();
}
void operator delete(void* p) noexcept {
    if (p && rendering) ++freesWhileRendering;
    std::free(p);
}
void operator delete(void* p, std::size_t) noexcept {
    ::operator delete(p);
}

namespace {

// The mixer on the offline device at 44.1 kHz with 256-frame periods, and a folder for sounds.
struct MixerTest : ::testing::Test {
    QTemporaryDir dir;
    WaveMixer mixer{44100};
    EngineWaveChannels channels{mixer};
    OfflineAudioDevice device{AudioStreamFormat{44100, 256, 2}};

    void SetUp() override { ASSERT_TRUE(device.start(mixer)); }

    // Writes `frames` frames of `sample(frame, channel)` and loads them into pad `note`.
    MixerWaveChannel& Load(int note, long frames, const std::function<float(long, int)>& sample,
                           int channels = 1, int rate = 44100) {
        const QString path = dir.filePath(QStringLiteral("%1.wav").arg(note));
        EXPECT_TRUE(WriteTestWave(path, rate, channels, frames, sample));
        MixerWaveChannel& channel = this->channels.channel(note);
        EXPECT_TRUE(channel.setFileName(path));
        return channel;
    }
    static float L(const std::vector<float>& s, long i) { return s[2 * i]; }
    static float R(const std::vector<float>& s, long i) { return s[2 * i + 1]; }
};

std::function<float(long, int)> Constant(float level) {
    return [level](long, int) { return level; };
}

}  // namespace

TEST_F(MixerTest, VolumeAndPanGiveTheirExactGainsAndPeaks) {
    MixerWaveChannel& channel = Load(60, 44100, Constant(0.5f));
    ASSERT_TRUE(channel.start());
    const struct {
        int volume, pan;
        double leftDb, rightDb;  // -100 dB stands for silence
    } cases[] = {{-2000, 0, -20, -20}, {0, -10000, 0, -100}, {0, 5000, -50, 0}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.pan);
        channel.setVolume(c.volume);
        channel.setPan(c.pan);
        device.pull();  // the change glides in over one period
        const std::vector<float> out = device.pull();
        const auto db = [](float level) { return std::max(20 * std::log10(level / 0.5), -100.0); };
        EXPECT_NEAR(db(std::fabs(L(out, 100))), c.leftDb, 0.1);
        EXPECT_NEAR(db(std::fabs(R(out, 100))), c.rightDb, 0.1);
        EXPECT_NEAR(channel.peakLeft(), std::fabs(L(out, 100)), 1e-6);
        EXPECT_NEAR(channel.peakRight(), std::fabs(R(out, 100)), 1e-6);
    }
}

TEST_F(MixerTest, StartsAndStopsWithoutClicksAndMonoPlaysOnBothSides) {
    MixerWaveChannel& channel = Load(57, 44100, Constant(0.8f));
    ASSERT_TRUE(channel.start());
    const std::vector<float> first = device.pull();
    // A 1 ms ramp: rising from near 0, never jumping by more than a step of the ramp.
    EXPECT_GT(L(first, 0), 0.0f) << "the first frame already sounds";
    EXPECT_LE(L(first, 0), 0.8f / 44 + 1e-6);
    for (long i = 1; i < 256; ++i) EXPECT_LE(L(first, i) - L(first, i - 1), 0.8f / 44 + 1e-6) << i;
    EXPECT_FLOAT_EQ(L(first, 100), 0.8f);
    EXPECT_FLOAT_EQ(R(first, 100), 0.8f);

    channel.stop();
    const std::vector<float> last = device.pull();
    for (long i = 1; i < 256; ++i) EXPECT_LE(L(last, i - 1) - L(last, i), 0.8f / 88 + 1e-6) << i;
    EXPECT_EQ(L(last, 88), 0.0f) << "silent within 2 ms";
    EXPECT_EQ(device.pull(), std::vector<float>(512, 0.0f));
}

TEST_F(MixerTest, HalfTheRateDoublesTheLengthAndTheEndIsReported) {
    QList<int> ended;
    QObject::connect(&channels, &WaveChannels::playbackEnded, [&](int note) { ended << note; });
    MixerWaveChannel& channel = Load(61, 1000, Constant(0.25f));
    channel.setFrequency(22050);
    ASSERT_TRUE(channel.start());
    const std::vector<float> out = device.pull(12);
    EXPECT_NEAR(std::count_if(out.begin(), out.end(), [](float s) { return s != 0.0f; }), 4000, 6);
    EXPECT_TRUE(channel.isPlaying()) << "until the notice is delivered";
    channels.collectEvents();
    EXPECT_EQ(ended, QList<int>({61}));
    EXPECT_FALSE(channel.isPlaying());
}

TEST_F(MixerTest, LoopsRepeatSeamlessly) {
    const long period = 300;  // not a multiple of the device period
    MixerWaveChannel& channel = Load(
        62, period,
        [&](long f, int c) { return (c == 0 ? 1.0f : -1.0f) * static_cast<float>(f) / period; }, 2);
    channel.setLooping(true);
    ASSERT_TRUE(channel.start());
    const std::vector<float> out = device.pull(8);
    for (long i = 100; i < 8 * 256; ++i) {
        ASSERT_FLOAT_EQ(L(out, i), static_cast<float>(i % period) / period) << i;
        ASSERT_FLOAT_EQ(R(out, i), -static_cast<float>(i % period) / period) << i;
    }
    channels.collectEvents();
    EXPECT_TRUE(channel.isPlaying());
    // Looping switched off while it sounds: it plays to the end of the current pass and stops.
    channel.setLooping(false);
    device.pull(4);
    channels.collectEvents();
    EXPECT_FALSE(channel.isPlaying());
}

TEST_F(MixerTest, AFileRewrittenUnderTheSameNameIsLoadedAfreshAndNoNameUnloads) {
    MixerWaveChannel& channel = Load(64, 4410, Constant(0.5f));
    EXPECT_EQ(channel.frames(), 4410);
    Load(64, 8820, Constant(0.5f), 2, 22050);
    EXPECT_EQ(channel.frames(), 8820);
    EXPECT_EQ(channel.fileRate(), 22050);

    EXPECT_TRUE(channel.setFileName(QString()));
    EXPECT_FALSE(channel.start());
}

TEST_F(MixerTest, BetweenSamplesAStraightLineStaysStraightOnBothInnerLoops) {
    for (int channels : {1, 2}) {
        SCOPED_TRACE(channels);
        MixerWaveChannel& channel = Load(
            66 + channels, 20000, [](long f, int) { return static_cast<float>(f) / 20000; },
            channels);
        channel.setFrequency(30011);  // every frame falls between two samples
        channel.start();
        const std::vector<float> out = device.pull(8);
        const double step = 30011.0 / 44100.0;
        for (long i = 50; i < 8 * 256; ++i) {
            ASSERT_NEAR(L(out, i), i * step / 20000, 2e-6) << i;
            ASSERT_NEAR(R(out, i), i * step / 20000, 2e-6) << i;
        }
        channel.stop();
        device.pull();
    }
}

TEST_F(MixerTest, SixteenChannelsStartLoopChangeRateAndStopWithoutAllocating) {
    // Sanity: the counter sees allocations while rendering, array forms too.
    rendering = true;
    ::operator delete[](::operator new[](16));  // a direct call, which the compiler cannot elide
    rendering = false;
    ASSERT_EQ(allocationsWhileRendering, 1);
    ASSERT_EQ(freesWhileRendering, 1);
    allocationsWhileRendering = freesWhileRendering = 0;

    for (int note = 57; note <= 72; ++note) {
        Load(
            note, 3000, [note](long f, int) { return 0.01f * ((f * note) % 100); }, note % 2 + 1,
            22050 + 1000 * (note - 57));
    }
    std::vector<float> period(2 * 256);
    const auto render = [&](int periods) {
        rendering = true;
        for (int i = 0; i < periods; ++i) mixer.render(period.data(), 256);
        rendering = false;
    };
    for (int round = 0; round < 20; ++round) {
        for (int note = 57; note <= 72; ++note) {
            MixerWaveChannel& channel = channels.channel(note);
            channel.setLooping(round % 3 != 0);
            channel.setFrequency(round % 2 ? 8000 + 3000 * (note - 57) : 0);
            channel.setVolume(-100 * round);
            channel.setPan(1000 * (note - 64));
            channel.start();  // a restart while sounding: the old sound fades out as a tail
        }
        render(3);
        if (round % 4 == 3) {
            for (int note = 57; note <= 72; ++note) channels.channel(note).stop();
        }
        render(3);
        channels.collectEvents();  // frees released sounds here, not in the callback
    }
    for (int note = 57; note <= 72; ++note) channels.channel(note).close();
    render(10);
    channels.collectEvents();
    EXPECT_EQ(allocationsWhileRendering, 0);
    EXPECT_EQ(freesWhileRendering, 0);
}
