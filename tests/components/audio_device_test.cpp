#include "components/audio/audio_api.h"
#include "components/audio/audio_device_settings.h"
#include "components/audio/null_audio_device.h"
#include "components/settings/memory_settings_store.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <thread>

namespace {

using Clock = std::chrono::steady_clock;

class CountingRenderer : public AudioRenderer {
  public:
    void render(float* stereo, int frames) noexcept override {
        stereo[0] = 0.0f;
        stereo[2 * frames - 1] = 0.0f;  // the whole period is there to write
        lastFrames.store(frames);
        periods.fetch_add(1);
    }
    std::atomic<int> periods{0};
    std::atomic<int> lastFrames{0};
};

class CountingSink : public AudioCaptureSink {
  public:
    void capture(const float* samples, int frames, int channels) noexcept override {
        for (int i = 0; i < frames * channels; ++i) {
            if (samples[i] != 0.0f) loud.store(true);
        }
        lastChannels.store(channels);
        total.fetch_add(frames);
    }
    std::atomic<long> total{0};
    std::atomic<int> lastChannels{0};
    std::atomic<bool> loud{false};
};

}  // namespace

// The null device is the sound card when there is none: it has to keep time, or pads would end
// early or late and the recorder's clock would run off.
TEST(NullAudioDevice, OutputRendersOnePeriodPerPeriodOfRealTime) {
    NullOutputDevice device(AudioStreamFormat{48000, 256, 2});
    CountingRenderer renderer;
    const Clock::time_point begin = Clock::now();
    ASSERT_TRUE(device.start(renderer));
    EXPECT_TRUE(device.isRunning());
    std::this_thread::sleep_for(std::chrono::milliseconds(600));
    const int periods = renderer.periods.load();
    const double elapsed = std::chrono::duration<double>(Clock::now() - begin).count();
    // One period at the start, then one per 256 frames of time.
    EXPECT_NEAR(periods, 1 + elapsed * 48000 / 256, 2.0);
    EXPECT_EQ(renderer.lastFrames.load(), 256);
    EXPECT_EQ(device.description(), "no sound device");

    device.stop();
    EXPECT_FALSE(device.isRunning());
    const int afterStop = renderer.periods.load();
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
    EXPECT_EQ(renderer.periods.load(), afterStop);

    // It starts again after a stop.
    ASSERT_TRUE(device.start(renderer));
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    device.stop();
    EXPECT_GT(renderer.periods.load(), afterStop);
}

TEST(NullAudioDevice, StopReturnsWithinAPeriodEvenWhenPeriodsAreLong) {
    // 8192 frames at 48 kHz: 171 ms a period.
    NullOutputDevice device(AudioStreamFormat{48000, 8192, 2});
    CountingRenderer renderer;
    ASSERT_TRUE(device.start(renderer));
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    const Clock::time_point begin = Clock::now();
    device.stop();
    EXPECT_LT(Clock::now() - begin, std::chrono::milliseconds(400));
    EXPECT_EQ(renderer.periods.load(), 1);
}

TEST(NullAudioDevice, InputRecordsSilenceAtRealTimeInTheChannelsAsked) {
    NullInputDevice mono(AudioStreamFormat{44100, 441, 1});
    EXPECT_EQ(mono.format().channels, 1);
    CountingSink sink;
    const Clock::time_point begin = Clock::now();
    ASSERT_TRUE(mono.start(sink));
    std::this_thread::sleep_for(std::chrono::milliseconds(500));
    const long frames = sink.total.load();
    const double elapsed = std::chrono::duration<double>(Clock::now() - begin).count();
    mono.stop();
    EXPECT_NEAR(frames, 441 + elapsed * 44100, 2 * 441);
    EXPECT_EQ(sink.lastChannels.load(), 1);
    EXPECT_FALSE(sink.loud.load());
    // More than two channels are not offered.
    EXPECT_EQ(NullInputDevice(AudioStreamFormat{48000, 256, 6}).format().channels, 2);
}

TEST(AudioDeviceChoice, StatusBarTextGivesApiRateAndPeriodLatency) {
    EXPECT_EQ(DescribeStream(AudioApi::Jack, {48000, 256, 2}), "JACK 48 kHz 5.3 ms");
    EXPECT_EQ(DescribeStream(AudioApi::Pulse, {44100, 256, 2}), "PulseAudio 44.1 kHz 5.8 ms");
    EXPECT_EQ(DescribeStream(AudioApi::Alsa, {96000, 64, 2}), "ALSA 96 kHz 0.7 ms");
    EXPECT_EQ(DescribeStream(AudioApi::Alsa, {22050, 1024, 1}), "ALSA 22.05 kHz 46.4 ms");
}

TEST(AudioDeviceChoice, ReadsTheAudioSettingsLeniently) {
    MemorySettingsStore store;
    AudioDeviceSettings settings = AudioDeviceSettings::Read(store);
    EXPECT_EQ(settings.api, AudioApi::Automatic);
    EXPECT_EQ(settings.periodFrames, 256);
    EXPECT_TRUE(settings.outputDevice.isEmpty());

    store.setValue("Audio", "Api", "PulseAudio");
    store.setValue("Audio", "OutputDevice", "Null Output");
    store.setValue("Audio", "InputDevice", "Monitor of Null Output");
    store.setValue("Audio", "PeriodFrames", "128 frames");
    settings = AudioDeviceSettings::Read(store);
    EXPECT_EQ(settings.api, AudioApi::Pulse);
    EXPECT_EQ(settings.outputDevice, "Null Output");
    EXPECT_EQ(settings.inputDevice, "Monitor of Null Output");
    EXPECT_EQ(settings.periodFrames, 128);

    store.setValue("Audio", "PeriodFrames", "none");
    EXPECT_EQ(AudioDeviceSettings::Read(store).periodFrames, 256);
    store.setValue("Audio", "PeriodFrames", "1000000");
    EXPECT_EQ(AudioDeviceSettings::Read(store).periodFrames, 8192);

    for (AudioApi api : {AudioApi::Jack, AudioApi::Pulse, AudioApi::Alsa, AudioApi::None}) {
        EXPECT_EQ(AudioApiFromText(AudioApiText(api)), api);
    }
    EXPECT_EQ(AudioApiFromText("jack"), AudioApi::Jack);
    EXPECT_EQ(AudioApiFromText(""), AudioApi::Automatic);
    EXPECT_EQ(AudioApiFromText("DirectSound"), AudioApi::Automatic);
    EXPECT_EQ(ResolveAudioApi(AudioApi::None), AudioApi::None);
}
