#include "capture_signals.h"
#include "components/audio/capture/wave_recorder.h"

#include <gtest/gtest.h>

#include <QFileInfo>
#include <QTemporaryDir>

#include <unistd.h>
#include <csignal>
#include <optional>

namespace {

constexpr char kTakeVariable[] = "OQ_CRASH_TEST_TAKE";

// In the child process: records a sine in real time for 2.5 s, then dies on the spot, as a
// process does when it is killed or the power goes.
void RecordAndDie(const QString& path) {
    OfflineAudioDevice device({48000, 256, 2});
    WaveRecorder recorder(device);
    if (!recorder.start(path, 2, 44100)) std::_Exit(1);
    DeviceFeeder(device, Sine(440, 48000, 48000 * 5 / 2, {0.5f, 0.5f}), true).join();
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
    ASSERT_GT(wave.channels, 0) << "the file must open as a wave file";
    EXPECT_EQ(wave.rate, 44100);
    EXPECT_EQ(wave.channels, 2);
    EXPECT_GE(wave.frames(), 44100 * 2) << "at least 2.5 s less a half";
    EXPECT_LE(wave.frames(), 44100 * 5 / 2 + 1);
    const long edge = 441;
    const long span = std::max<long>(wave.frames() - edge, edge + 1) - edge;
    const SineFit left = FitSine(Channel(wave, 0, edge, span), 440, 44100, edge);
    EXPECT_NEAR(left.amplitude, 0.5, 0.002);
    EXPECT_LT(left.residualRms, 0.001) << "every frame that the header counts is right";
}

}  // namespace
