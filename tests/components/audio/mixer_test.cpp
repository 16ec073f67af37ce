#include "components/audio/engine_wave_channels.h"
#include "components/audio/offline_audio_device.h"
#include "components/audio/wave_mixer.h"
#include "support/wave_files.h"

#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <cmath>

namespace {

double Db(double ratio) {
    return 20.0 * std::log10(ratio);
}

// The mixer on the offline device at 44.1 kHz with 256-frame periods, and a folder for sounds.
struct MixerTest : ::testing::Test {
    QTemporaryDir dir;
    WaveMixer mixer{44100};
    EngineWaveChannels channels{mixer};
    OfflineAudioDevice device{AudioStreamFormat{44100, 256, 2}};

    void SetUp() override { ASSERT_TRUE(device.start(mixer)); }

    QString Constant(const char* name, float level, long frames, int channels = 1,
                     int rate = 44100) {
        const QString path = dir.filePath(QString::fromLatin1(name));
        EXPECT_TRUE(WriteTestWave(path, rate, channels, frames, [&](long, int) { return level; }));
        return path;
    }
    // Left and right of frame i of the rendered stream.
    static float L(const std::vector<float>& s, long i) { return s[2 * i]; }
    static float R(const std::vector<float>& s, long i) { return s[2 * i + 1]; }
};

}  // namespace

TEST_F(MixerTest, VolumeAndPanGiveTheirExactGains) {
    MixerWaveChannel& channel = channels.channel(60);
    ASSERT_TRUE(channel.setFileName(Constant("dc.wav", 0.5f, 44100)));
    channel.setVolume(-2000);
    ASSERT_TRUE(channel.start());
    std::vector<float> out = device.pull(4);
    EXPECT_NEAR(Db(L(out, 600) / 0.5), -20.0, 0.1);
    EXPECT_NEAR(Db(R(out, 600) / 0.5), -20.0, 0.1);

    channel.setVolume(0);
    channel.setPan(-10000);
    device.pull();  // the change glides in over one period
    out = device.pull();
    EXPECT_FLOAT_EQ(L(out, 100), 0.5f);
    EXPECT_LE(Db(std::fabs(R(out, 100)) / 0.5), -100.0 + 0.01);

    channel.setPan(5000);
    device.pull();
    out = device.pull();
    EXPECT_NEAR(Db(L(out, 100) / 0.5), -50.0, 0.1);
    EXPECT_FLOAT_EQ(R(out, 100), 0.5f);
    EXPECT_NEAR(channel.peakRight(), 0.5f, 1e-6);
    EXPECT_NEAR(Db(channel.peakLeft() / 0.5), -50.0, 0.1);
}

TEST_F(MixerTest, StartsAndStopsWithoutClicksAndMonoPlaysOnBothSides) {
    MixerWaveChannel& channel = channels.channel(57);
    ASSERT_TRUE(channel.setFileName(Constant("mono.wav", 0.8f, 44100)));
    ASSERT_TRUE(channel.start());
    const std::vector<float> first = device.pull();
    // A 1 ms ramp: rising from near 0, never jumping by more than a step of the ramp.
    EXPECT_GT(L(first, 0), 0.0f) << "the first frame already sounds";
    EXPECT_LE(L(first, 0), 0.8f / 44 + 1e-6);
    for (long i = 1; i < 256; ++i) EXPECT_LE(L(first, i) - L(first, i - 1), 0.8f / 44 + 1e-6) << i;
    EXPECT_FLOAT_EQ(L(first, 100), 0.8f);
    EXPECT_FLOAT_EQ(R(first, 100), 0.8f);

    channel.stop();
    EXPECT_FALSE(channel.isPlaying());
    const std::vector<float> last = device.pull();
    for (long i = 1; i < 256; ++i) EXPECT_LE(L(last, i - 1) - L(last, i), 0.8f / 88 + 1e-6) << i;
    EXPECT_EQ(L(last, 88), 0.0f) << "silent within 2 ms";
    EXPECT_EQ(device.pull(), std::vector<float>(512, 0.0f));
}

TEST_F(MixerTest, HalfTheRateDoublesTheLengthAndTheEndIsReported) {
    MixerWaveChannel& channel = channels.channel(61);
    int ended = 0;
    QObject::connect(&channels, &WaveChannels::playbackEnded, [&](int note) {
        EXPECT_EQ(note, 61);
        ++ended;
    });
    ASSERT_TRUE(channel.setFileName(Constant("short.wav", 0.25f, 1000)));
    channel.setFrequency(22050);
    ASSERT_TRUE(channel.start());
    const std::vector<float> out = device.pull(12);
    long sounding = 0;
    for (long i = 0; i < 12 * 256; ++i) sounding += L(out, i) != 0.0f;
    EXPECT_NEAR(sounding, 2000, 3);

    EXPECT_TRUE(channel.isPlaying()) << "until the notice is delivered";
    channels.collectEvents();
    EXPECT_EQ(ended, 1);
    EXPECT_FALSE(channel.isPlaying());
}

TEST_F(MixerTest, LoopsRepeatSeamlessly) {
    MixerWaveChannel& channel = channels.channel(62);
    const long period = 300;  // not a multiple of the device period
    const QString path = dir.filePath("saw.wav");
    ASSERT_TRUE(WriteTestWave(path, 44100, 2, period, [&](long f, int c) {
        return (c == 0 ? 1.0f : -1.0f) * static_cast<float>(f) / period;
    }));
    ASSERT_TRUE(channel.setFileName(path));
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

TEST_F(MixerTest, UnloadableFilesAndEmptyNames) {
    MixerWaveChannel& channel = channels.channel(63);
    EXPECT_FALSE(channel.setFileName(dir.filePath("missing.wav")));
    EXPECT_FALSE(channel.lastError().isEmpty());
    EXPECT_FALSE(channel.start());

    const QString junk = dir.filePath("junk.wav");
    QFile file(junk);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(QByteArray(5000, 'x'));
    file.close();
    EXPECT_FALSE(channel.setFileName(junk));

    ASSERT_TRUE(channel.setFileName(Constant("ok.wav", 0.5f, 100)));
    EXPECT_TRUE(channel.setFileName(QString()));
    EXPECT_TRUE(channel.fileName().isEmpty());
    EXPECT_FALSE(channel.start());
}

TEST_F(MixerTest, AChangedFileIsLoadedAfreshUnderTheSameName) {
    MixerWaveChannel& channel = channels.channel(64);
    const QString path = Constant("take.wav", 0.5f, 4410);
    ASSERT_TRUE(channel.setFileName(path));
    EXPECT_EQ(channel.frames(), 4410);
    Constant("take.wav", 0.5f, 8820, 2, 22050);
    ASSERT_TRUE(channel.setFileName(path));
    EXPECT_EQ(channel.frames(), 8820);
    EXPECT_EQ(channel.fileRate(), 22050);
}

TEST_F(MixerTest, StereoAndMonoInterpolateAlikeAtAnyRate) {
    // The left side of a stereo file and a mono file of the same samples must come out the same,
    // whichever inner loop renders them; the rate puts every frame between two samples.
    auto wobble = [](long f, int c) {
        return c == 0 ? 0.4f * std::sin(0.05f * f) + 0.1f * std::cos(0.31f * f) : 0.0f;
    };
    const QString stereo = dir.filePath("stereo.wav");
    const QString mono = dir.filePath("mono.wav");
    ASSERT_TRUE(WriteTestWave(stereo, 44100, 2, 5000, wobble));
    ASSERT_TRUE(WriteTestWave(mono, 44100, 1, 5000, wobble));
    MixerWaveChannel& a = channels.channel(65);
    MixerWaveChannel& b = channels.channel(66);
    ASSERT_TRUE(a.setFileName(stereo));
    ASSERT_TRUE(b.setFileName(mono));
    a.setFrequency(30011);
    b.setFrequency(30011);
    a.setPan(-10000);  // only the left side of the stereo file is heard
    a.start();
    const std::vector<float> fromStereo = device.pull(10);
    a.stop();
    device.pull(2);
    b.setPan(-10000);
    b.start();
    const std::vector<float> fromMono = device.pull(10);
    for (long i = 0; i < 10 * 256; ++i) ASSERT_NEAR(L(fromStereo, i), L(fromMono, i), 1e-6f) << i;
    EXPECT_GT(*std::max_element(fromMono.begin(), fromMono.end()), 0.3f);
}

TEST_F(MixerTest, BetweenSamplesAStraightLineStaysStraight) {
    // The interpolator follows any straight line exactly, on both inner loops.
    for (int channels : {1, 2}) {
        SCOPED_TRACE(channels);
        const QString path = dir.filePath(QStringLiteral("ramp%1.wav").arg(channels));
        ASSERT_TRUE(WriteTestWave(path, 44100, channels, 20000,
                                  [](long f, int) { return static_cast<float>(f) / 20000; }));
        MixerWaveChannel& channel =
            channels == 1 ? this->channels.channel(67) : this->channels.channel(68);
        ASSERT_TRUE(channel.setFileName(path));
        channel.setFrequency(30011);
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
