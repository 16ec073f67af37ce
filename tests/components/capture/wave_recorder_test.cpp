#include "components/audio/capture/wave_recorder.h"
#include "capture_signals.h"

#include <gtest/gtest.h>

#include <QFileInfo>
#include <QSignalSpy>
#include <QTemporaryDir>

#include <sys/resource.h>

#include <csignal>

namespace {

class WaveRecorderTest : public ::testing::Test {
  protected:
    QString take(const char* name) const { return folder.filePath(QString::fromLatin1(name)); }

    // Records `samples` from a device of `format` into `path` and reads the file back.
    ReadWave record(AudioStreamFormat format, std::vector<float> samples, const QString& path,
                    int channels, int rate) {
        OfflineAudioDevice device(format);
        WaveRecorder recorder(device);
        if (!recorder.start(path, channels, rate)) ADD_FAILURE() << recorder.errorText();
        DeviceFeeder(device, std::move(samples)).join();
        recorder.stop();
        EXPECT_FALSE(device.isRunning());
        EXPECT_EQ(recorder.lostFrames(), 0);
        milliseconds = recorder.recordedMilliseconds();
        return ReadTestWave(path);
    }

    QTemporaryDir folder;
    qint64 milliseconds = 0;
};

TEST_F(WaveRecorderTest, RecordsASineAtEachTakeRate) {
    for (int rate : {11025, 22050, 44100}) {
        SCOPED_TRACE(rate);
        const ReadWave wave =
            record({48000, 256, 2}, Sine(440, 48000, 96000, {0.5f, 0.25f}), take("a.wav"), 2, rate);
        EXPECT_EQ(wave.rate, rate);
        ASSERT_EQ(wave.channels, 2);
        // Output frame k is the input at k * 48000 / rate: 2 s give 2 * rate frames.
        EXPECT_NEAR(wave.frames(), 2 * rate, 1);
        EXPECT_NEAR(milliseconds, 2000, 1);
        const long edge = rate / 50;  // the filter sees silence beyond both ends
        const long span = wave.frames() - 2 * edge;
        const SineFit left = FitSine(Channel(wave, 0, edge, span), 440, rate, edge);
        const SineFit right = FitSine(Channel(wave, 1, edge, span), 440, rate, edge);
        EXPECT_NEAR(left.amplitude, 0.5, 0.002);
        EXPECT_NEAR(right.amplitude, 0.25, 0.002);
        EXPECT_NEAR(left.phase, 0.0, 0.01) << "no frame slipped, repeated or was delayed";
        EXPECT_LT(left.residualRms, 0.001) << "16-bit steps and the filter's ripple only";
        EXPECT_LT(right.residualRms, 0.001);
    }
}

TEST_F(WaveRecorderTest, MonoTakesAverageAndStereoTakesDuplicate) {
    const std::vector<float> stereo = Sine(440, 44100, 44100, {0.6f, 0.2f});
    const ReadWave mono = record({44100, 256, 2}, stereo, take("mono.wav"), 1, 44100);
    ASSERT_EQ(mono.channels, 1);
    ASSERT_EQ(mono.frames(), 44100);
    for (long f = 0; f < mono.frames(); ++f)
        ASSERT_NEAR(mono.samples[f], 0.5f * (stereo[2 * f] + stereo[2 * f + 1]), 1.0 / 32768) << f;

    const std::vector<float> single = Sine(440, 44100, 44100, {0.3f});
    const ReadWave both = record({44100, 256, 1}, single, take("stereo.wav"), 2, 44100);
    ASSERT_EQ(both.channels, 2);
    ASSERT_EQ(both.frames(), 44100);
    for (long f = 0; f < both.frames(); ++f) {
        ASSERT_NEAR(both.samples[2 * f], single[f], 1.0 / 32768) << f;
        ASSERT_EQ(both.samples[2 * f], both.samples[2 * f + 1]) << f;
    }
}

TEST_F(WaveRecorderTest, ReplacesALongerFileOfTheSameName) {
    const QString path = take("default3.wav");
    record({44100, 256, 2}, Sine(1000, 44100, 3 * 44100, {0.9f, 0.9f}), path, 2, 44100);
    const ReadWave wave =
        record({48000, 256, 2}, Sine(440, 48000, 24000, {0.5f, 0.5f}), path, 1, 11025);
    EXPECT_EQ(wave.rate, 11025);
    EXPECT_EQ(wave.channels, 1);
    EXPECT_NEAR(wave.frames(), 11025 / 2, 1);
    EXPECT_EQ(QFileInfo(path).size(), 44 + wave.frames() * 2) << "nothing of the old file is left";
    EXPECT_NEAR(FitSine(Channel(wave, 0, 200, 5000), 440, 11025, 200).amplitude, 0.5, 0.002);
}

TEST_F(WaveRecorderTest, RefusesToStartWhereNoFileCanBeMade) {
    OfflineAudioDevice device({48000, 256, 2});
    WaveRecorder recorder(device);
    for (const QString& path : {take("no such folder/take.wav"), folder.path()}) {
        EXPECT_FALSE(recorder.start(path, 2, 44100));
        EXPECT_TRUE(recorder.errorText().contains(path)) << recorder.errorText();
        EXPECT_FALSE(recorder.isRecording());
        EXPECT_FALSE(device.isRunning()) << "the device stays closed";
    }
    EXPECT_FALSE(recorder.start(take("odd.wav"), 3, 44100)) << "three channels";
    EXPECT_FALSE(recorder.start(take("odd.wav"), 2, 0)) << "no rate";
    EXPECT_TRUE(recorder.start(take("fine.wav"), 2, 44100)) << "a failed start leaves no trace";
}

TEST_F(WaveRecorderTest, ReportsADeviceThatWentAway) {
    OfflineAudioDevice device({48000, 256, 2});
    WaveRecorder recorder(device);
    QSignalSpy stopped(&recorder, &WaveRecorder::stoppedByItself);
    ASSERT_TRUE(recorder.start(take("lost.wav"), 2, 44100));
    DeviceFeeder(device, Sine(440, 48000, 48000, {0.5f, 0.5f})).join();
    device.stop();  // as a device does when it is unplugged or its server quits

    ASSERT_TRUE(stopped.wait(2000));
    const QString reason = stopped.first().first().toString();
    EXPECT_TRUE(reason.contains("device")) << reason;
    EXPECT_FALSE(recorder.isRecording());
    EXPECT_NEAR(ReadTestWave(take("lost.wav")).frames(), 44100, 1) << "what came before is kept";
}

// While in scope, the process may write no file larger than `bytes`; a write past that fails
// with EFBIG instead of ending the process.
class FileSizeLimit {
  public:
    explicit FileSizeLimit(rlim_t bytes) {
        getrlimit(RLIMIT_FSIZE, &saved_);
        rlimit limited = saved_;
        limited.rlim_cur = bytes;
        setrlimit(RLIMIT_FSIZE, &limited);
        previous_ = std::signal(SIGXFSZ, SIG_IGN);
    }
    ~FileSizeLimit() {
        setrlimit(RLIMIT_FSIZE, &saved_);
        std::signal(SIGXFSZ, previous_);
    }

  private:
    rlimit saved_{};
    void (*previous_)(int) = nullptr;
};

TEST_F(WaveRecorderTest, StopsByItselfWhenTheFileCannotGrow) {
    OfflineAudioDevice device({48000, 256, 2});
    WaveRecorder recorder(device);
    QSignalSpy stopped(&recorder, &WaveRecorder::stoppedByItself);
    {
        FileSizeLimit limit(64 * 1024);  // a third of a second of the take
        ASSERT_TRUE(recorder.start(take("full.wav"), 2, 44100));
        DeviceFeeder(device, Sine(440, 48000, 96000, {0.5f, 0.5f})).join();
        ASSERT_TRUE(stopped.wait(2000));
    }
    EXPECT_FALSE(stopped.first().first().toString().isEmpty());
    EXPECT_FALSE(recorder.isRecording());
    EXPECT_FALSE(device.isRunning());
    const ReadWave wave = ReadTestWave(take("full.wav"));
    EXPECT_GT(wave.frames(), 8000) << "the file up to the failure still plays";
    EXPECT_LE(recorder.recordedMilliseconds(), 64 * 1024 / 4 * 1000 / 44100);
}

}  // namespace
