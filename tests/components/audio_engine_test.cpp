#include "components/audio/audio_engine.h"
#include "components/audio/devices/audio_api.h"
#include "components/audio/devices/offline_audio_device.h"
#include "components/settings/memory_settings_store.h"
#include "support/wave_files.h"

#include <QSignalSpy>
#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

namespace {

// Pad 60 of the engine with a sound of level 0.25, `frames` frames at 48 kHz.
MixerWaveChannel& LoadPad(AudioEngine& engine, const QTemporaryDir& dir, long frames) {
    const QString path = dir.filePath("pad.wav");
    EXPECT_TRUE(WriteTestWave(path, 48000, 1, frames, [](long, int) { return 0.25f; }));
    MixerWaveChannel& pad = engine.channels().channel(60);
    EXPECT_TRUE(pad.setFileName(path));
    return pad;
}

float Loudest(const std::vector<float>& samples) {
    return std::abs(*std::ranges::max_element(samples, {}, [](float s) { return std::abs(s); }));
}

// Points JACK and PulseAudio clients at servers that do not exist, for the life of the object.
struct NoSoundServers {
    const QByteArray jack = qgetenv("JACK_DEFAULT_SERVER"), pulse = qgetenv("PULSE_SERVER");
    NoSoundServers() {
        qputenv("JACK_DEFAULT_SERVER", "oq-no-such-server");
        qputenv("PULSE_SERVER", "unix:/nonexistent/oq-no-such-socket");
    }
    ~NoSoundServers() {
        Restore("JACK_DEFAULT_SERVER", jack);
        Restore("PULSE_SERVER", pulse);
    }
    static void Restore(const char* name, const QByteArray& value) {
        if (value.isNull()) qunsetenv(name);
        if (!value.isNull()) qputenv(name, value);
    }
};

struct NullSink : AudioCaptureSink {
    void capture(const float*, int, int) noexcept override {}
};

}  // namespace

TEST(AudioEngine, PlaysThroughTheInjectedDeviceAndAStopEndsAndForgetsItsSounds) {
    auto owned = std::make_unique<OfflineAudioDevice>(AudioStreamFormat{44100, 128, 2});
    OfflineAudioDevice& device = *owned;
    AudioEngine engine(std::move(owned));
    ASSERT_TRUE(engine.start());
    EXPECT_EQ(engine.mixer().deviceRate(), 44100);
    QTemporaryDir dir;
    ASSERT_TRUE(LoadPad(engine, dir, 48000).start());
    EXPECT_NEAR(Loudest(device.pull(4)), 0.25f, 1e-3f);
    QSignalSpy ended(&engine.channels(), &WaveChannels::playbackEnded);

    engine.stop();
    // Sounds cut off by the stop have ended, and the pads hear of it.
    EXPECT_FALSE(engine.channels().channel(60).isPlaying());
    ASSERT_EQ(ended.count(), 1);
    EXPECT_EQ(ended[0][0].toInt(), 60);
    // The sound that played before the stop does not come back with the next start.
    ASSERT_TRUE(engine.restart());
    EXPECT_EQ(Loudest(device.pull(4)), 0.0f);
}

TEST(AudioEngine, FallsBackToSilenceWithANoticeWhenTheChosenDeviceIsMissing) {
    NoSoundServers noServers;
    const struct {
        const char* api;
        const char* device;
        const char* reason;
    } cases[] = {
        {"JACK", "", "no JACK server runs"},
        {"PulseAudio", "", "no PulseAudio server answers"},
        {"ALSA", "Orvelle Quindara no such card", "no output device"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.api);
        MemorySettingsStore settings;
        settings.setValue("Audio", "Api", c.api);
        settings.setValue("Audio", "OutputDevice", c.device);
        AudioEngine engine(settings);
        QSignalSpy notices(&engine, &AudioEngine::statusNotice);
        EXPECT_FALSE(engine.start());
        ASSERT_EQ(notices.count(), 1);
        const QString notice = notices.at(0).at(0).toString();
        EXPECT_TRUE(notice.startsWith("Sound device could not be opened (") &&
                    notice.contains(c.reason) && notice.endsWith("): playing silently"))
            << notice;
        ASSERT_NE(engine.outputDevice(), nullptr);
        EXPECT_TRUE(engine.outputDevice()->isRunning());
    }
    // Without their servers, JACK and PulseAudio list nothing.
    for (AudioApi api : {AudioApi::Jack, AudioApi::Pulse}) {
        EXPECT_TRUE(AudioOutputDeviceNames(api).isEmpty());
        EXPECT_TRUE(AudioInputDeviceNames(api).isEmpty());
    }
}

TEST(AudioEngine, OnTheNullDeviceSoundsEndAndRestartAppliesChangedSettings) {
    NoSoundServers noServers;
    MemorySettingsStore settings;
    settings.setValue("Audio", "Api", "None");
    AudioEngine engine(settings);
    QSignalSpy notices(&engine, &AudioEngine::statusNotice);
    ASSERT_TRUE(engine.start());
    // Sounds still end, and report it, as on a sound card.
    QTemporaryDir dir;
    QSignalSpy ended(&engine.channels(), &WaveChannels::playbackEnded);
    ASSERT_TRUE(LoadPad(engine, dir, 4800).start());  // 0.1 s
    ASSERT_TRUE(ended.wait(3000));
    EXPECT_EQ(ended.at(0).at(0).toInt(), 60);

    NullSink sink;
    EXPECT_TRUE(engine.startCapture(sink, 1));
    EXPECT_EQ(engine.inputDevice()->format().channels, 1);
    EXPECT_EQ(notices.count(), 0) << "no sound device was asked for";
    settings.setValue("Audio", "Api", "JACK");
    EXPECT_FALSE(engine.restart());
    EXPECT_FALSE(engine.startCapture(sink, 2));
    ASSERT_EQ(notices.count(), 2);
    EXPECT_TRUE(notices.at(1).at(0).toString().startsWith("Recording device could not be opened"));
    EXPECT_TRUE(engine.inputDevice()->isRunning());
    EXPECT_EQ(engine.inputDevice()->format().channels, 2);
    engine.stopCapture();
    EXPECT_EQ(engine.inputDevice(), nullptr);
    settings.setValue("Audio", "Api", "None");
    EXPECT_TRUE(engine.restart());
    EXPECT_EQ(notices.count(), 2);
}
