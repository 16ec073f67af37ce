#include "components/audio/capture/wave_recorder.h"
#include "support/capture_signals.h"

#include <gtest/gtest.h>

#include <QFileInfo>
#include <QSignalSpy>
#include <QTemporaryDir>

#include <sys/resource.h>
#include <unistd.h>

#include <csignal>
#include <optional>

namespace {

struct WaveRecorderTest : ::testing::Test {
    QString take(const char* name) const { return folder.filePath(QString::fromLatin1(name)); }
    QTemporaryDir folder;
};

// A second of a 440 Hz sine at each take rate and channel count, each take over the one before.
TEST_F(WaveRecorderTest, RecordsEachRateAndChannelCountOverTheLastTake) {
    const struct {
        int deviceRate;
        std::vector<float> played;  // a level for each of the device's channels
        int channels;
        int rate;
        std::vector<double> levels;  // mono takes average, stereo takes of mono duplicate
    } takes[] = {{48000, {0.5f, 0.25f}, 2, 44100, {0.5, 0.25}},
                 {48000, {0.5f, 0.25f}, 2, 22050, {0.5, 0.25}},
                 {48000, {0.5f, 0.25f}, 2, 11025, {0.5, 0.25}},
                 {44100, {0.6f, 0.2f}, 1, 44100, {0.4}},
                 {44100, {0.3f}, 2, 44100, {0.3, 0.3}}};
    const QString path = take("take.wav");
    for (const auto& t : takes) {
        SCOPED_TRACE(testing::Message() << t.channels << " channels at " << t.rate);
        OfflineAudioDevice device({t.deviceRate, 256, int(t.played.size())});
        WaveRecorder recorder(device);
        ASSERT_TRUE(recorder.start(path, t.channels, t.rate)) << recorder.errorText();
        Feed(device, Sine(440, t.deviceRate, t.deviceRate, t.played));
        recorder.stop();
        EXPECT_FALSE(device.isRunning());
        EXPECT_EQ(recorder.lostFrames(), 0);
        EXPECT_NEAR(recorder.recordedMilliseconds(), 1000, 1);
        const ReadWave wave = ReadTestWave(path);
        EXPECT_EQ(wave.rate, t.rate);
        ASSERT_EQ(wave.channels, t.channels);
        EXPECT_NEAR(wave.frames(), t.rate, 1);
        EXPECT_EQ(QFileInfo(path).size(), 44 + wave.frames() * t.channels * 2);
        const long edge = t.rate / 50;  // the filter sees silence beyond both ends
        // Off by a few 16-bit steps at most: no frame slipped, repeated or was delayed.
        for (int c = 0; c < t.channels; ++c) {
            EXPECT_LT(Deviation(wave, c, t.levels[c], 440, edge, wave.frames() - edge), 1e-4) << c;
        }
    }
}

TEST_F(WaveRecorderTest, RefusesToStartWhereNoFileCanBeMade) {
    OfflineAudioDevice device({48000, 256, 2});
    WaveRecorder recorder(device);
    for (const QString& path : {take("no such folder/take.wav"), folder.path()}) {
        EXPECT_FALSE(recorder.start(path, 2, 44100));
        EXPECT_TRUE(recorder.errorText().contains(path)) << recorder.errorText();
        EXPECT_FALSE(recorder.isRecording() || device.isRunning());
    }
    EXPECT_FALSE(recorder.start(take("odd.wav"), 3, 44100)) << "three channels";
    EXPECT_FALSE(recorder.start(take("odd.wav"), 2, 0)) << "no rate";
    EXPECT_TRUE(recorder.start(take("fine.wav"), 2, 44100)) << "a failed start leaves no trace";
}

// While in scope, no file may grow past `bytes`: a write beyond fails with EFBIG instead of
// ending the process, as SIGXFSZ stays ignored.
struct FileSizeLimit {
    explicit FileSizeLimit(rlim_t bytes) {
        getrlimit(RLIMIT_FSIZE, &saved);
        const rlimit limited{std::min(bytes, saved.rlim_max), saved.rlim_max};
        std::signal(SIGXFSZ, SIG_IGN);
        setrlimit(RLIMIT_FSIZE, &limited);
    }
    ~FileSizeLimit() { setrlimit(RLIMIT_FSIZE, &saved); }
    rlimit saved{};
};

// The device goes away (unplugged, its server quit) or the disk fills up: the take ends by
// itself with a reason, and what came before still plays.
TEST_F(WaveRecorderTest, StopsByItselfWhenTheDeviceGoesOrTheFileCannotGrow) {
    const struct {
        rlim_t fileLimit;  // 64 KiB hold a third of a second of the take
        long fewestFrames;
        qint64 mostMilliseconds;
    } ends[] = {{RLIM_INFINITY, 44099, 1001}, {64 * 1024, 8000, 64 * 1024 / 4 * 1000 / 44100}};
    for (const auto& end : ends) {
        const bool deviceGoes = end.fileLimit == RLIM_INFINITY;
        OfflineAudioDevice device({48000, 256, 2});
        WaveRecorder recorder(device);
        QSignalSpy stopped(&recorder, &WaveRecorder::stoppedByItself);
        {
            FileSizeLimit limit(end.fileLimit);
            ASSERT_TRUE(recorder.start(take("cut.wav"), 2, 44100));
            Feed(device, Sine(440, 48000, 48000, {0.5f, 0.5f}));
            if (deviceGoes) device.stop();
            ASSERT_TRUE(stopped.wait(2000));
        }
        const QString reason = stopped.first().first().toString();
        EXPECT_TRUE(reason.contains(deviceGoes ? "device" : "")) << reason;
        EXPECT_FALSE(reason.isEmpty() || recorder.isRecording() || device.isRunning());
        EXPECT_GE(ReadTestWave(take("cut.wav")).frames(), end.fewestFrames);
        EXPECT_LE(recorder.recordedMilliseconds(), end.mostMilliseconds);
    }
}

constexpr char kTakeVariable[] = "OQ_CRASH_TEST_TAKE";

// In the child process: records a sine in real time for 2.5 s, then dies on the spot, as a
// process does when it is killed or the power goes.
void RecordAndDie(const QString& path) {
    OfflineAudioDevice device({48000, 256, 2});
    WaveRecorder recorder(device);
    if (!recorder.start(path, 2, 44100)) std::_Exit(1);
    Feed(device, Sine(440, 48000, 48000 * 5 / 2, {0.5f, 0.5f}), true);
    ::kill(::getpid(), SIGKILL);
}

TEST(WaveRecorderCrash, AKilledRecordingLeavesAllButTheLastHalfSecond) {
    // The child runs this test again from the start in a fresh process; it finds the parent's
    // file name in the environment and makes no folder of its own, which it could not remove.
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    std::optional<QTemporaryDir> folder;
    if (qEnvironmentVariableIsEmpty(kTakeVariable)) {
        folder.emplace();
        qputenv(kTakeVariable, folder->filePath(QStringLiteral("default0.wav")).toLocal8Bit());
    }
    const QString path = qEnvironmentVariable(kTakeVariable);

    EXPECT_EXIT(RecordAndDie(path), ::testing::KilledBySignal(SIGKILL), "");
    qunsetenv(kTakeVariable);

    const std::int64_t declared = DeclaredDataBytes(path);
    EXPECT_GE(declared, 44100 * 2 * 4) << "the header counts at least 2.5 s less a half";
    EXPECT_LE(declared + 44, QFileInfo(path).size()) << "and no more than the file holds";
    const ReadWave wave = ReadTestWave(path);
    ASSERT_EQ(wave.channels, 2) << "the file must open as a wave file";
    EXPECT_EQ(wave.rate, 44100);
    EXPECT_LE(wave.frames(), 44100 * 5 / 2 + 1);
    EXPECT_LT(Deviation(wave, 0, 0.5, 440, 441, wave.frames() - 441), 1e-4)
        << "every frame that the header counts is right";
}

}  // namespace
