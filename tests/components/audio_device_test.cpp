#include "components/audio/devices/audio_api.h"
#include "components/audio/devices/audio_device_settings.h"
#include "components/audio/devices/null_audio_device.h"
#include "components/settings/memory_settings_store.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <thread>

namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

// Counts the periods a device asks for and the frames in them.
struct Counter : AudioRenderer, AudioCaptureSink {
    void render(float* stereo, int frames) noexcept override {
        stereo[0] = stereo[2 * frames - 1] = 0.0f;  // the whole period is there to write
        count(frames, 2);
    }
    void capture(const float* samples, int frames, int channels) noexcept override {
        for (int i = 0; i < frames * channels; ++i) loud = loud || samples[i] != 0.0f;
        count(frames, channels);
    }
    void count(int frames, int channels) {
        periods.fetch_add(1);
        total.fetch_add(frames);
        lastChannels = channels;
    }
    std::atomic<int> periods{0}, lastChannels{0};
    std::atomic<long> total{0};
    std::atomic<bool> loud{false};
};

double SecondsSince(Clock::time_point begin) {
    return std::chrono::duration<double>(Clock::now() - begin).count();
}

}  // namespace

// The null devices are the sound card when there is none: they have to keep time, or pads would
// end early or late and the recorder's clock would run off.
TEST(NullAudioDevice, OutputAndInputKeepRealTimeAndStopAtOnce) {
    NullOutputDevice output(AudioStreamFormat{48000, 256, 2});
    NullInputDevice input(AudioStreamFormat{44100, 441, 1});
    Counter rendered, recorded;
    const Clock::time_point begin = Clock::now();
    ASSERT_TRUE(output.start(rendered));
    ASSERT_TRUE(input.start(recorded));
    std::this_thread::sleep_for(milliseconds(600));
    // One period at the start, then one a period of time.
    EXPECT_NEAR(rendered.periods, 1 + SecondsSince(begin) * 48000 / 256, 2.0);
    EXPECT_NEAR(recorded.total, 441 + SecondsSince(begin) * 44100, 2 * 441);
    output.stop();
    input.stop();
    EXPECT_EQ(rendered.total, 256L * rendered.periods);
    const int afterStop = rendered.periods;
    std::this_thread::sleep_for(milliseconds(50));
    EXPECT_EQ(rendered.periods, afterStop);
    EXPECT_EQ(recorded.lastChannels, 1);
    EXPECT_FALSE(recorded.loud);

    // Long periods (8192 frames, 171 ms) do not hold up a stop, and it starts again after one.
    NullOutputDevice slow(AudioStreamFormat{48000, 8192, 2});
    Counter slowRendered;
    for (int run = 1; run <= 2; ++run) {
        ASSERT_TRUE(slow.start(slowRendered));
        std::this_thread::sleep_for(milliseconds(20));
        const Clock::time_point stopping = Clock::now();
        slow.stop();
        EXPECT_LT(SecondsSince(stopping), 0.4);
        EXPECT_EQ(slowRendered.periods, run);
    }
}

TEST(AudioDeviceChoice, ReadsTheAudioSettingsLeniently) {
    MemorySettingsStore store;
    // Unreadable periods fall back to the default, huge ones are held to the largest.
    for (const auto& [text, frames] :
         {std::pair{"128 frames", 128}, {"none", 256}, {"1000000", 8192}}) {
        store.setValue("Audio", "PeriodFrames", text);
        EXPECT_EQ(AudioDeviceSettings::Read(store).periodFrames, frames) << text;
    }
    for (AudioApi api : {AudioApi::Jack, AudioApi::Pulse, AudioApi::Alsa, AudioApi::None})
        EXPECT_EQ(AudioApiFromText(AudioApiText(api)), api);
    EXPECT_EQ(AudioApiFromText("DirectSound"), AudioApi::Automatic);
}
