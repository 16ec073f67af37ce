#include "components/audio/audio_engine.h"
#include "components/audio/audio_api.h"
#include "components/audio/offline_audio_device.h"
#include "components/settings/memory_settings_store.h"
#include "engine/note_slots.h"

#include <QSignalSpy>

#include "support/wave_files.h"

#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

namespace {

std::shared_ptr<const SampleBuffer> ConstantSound(float value, int frames, int rate) {
    auto buffer = std::make_shared<SampleBuffer>();
    buffer->samples.assign(static_cast<std::size_t>(frames), value);
    buffer->channels = 1;
    buffer->sampleRate = rate;
    buffer->frames = frames;
    return buffer;
}

float Loudest(const std::vector<float>& samples) {
    float loudest = 0.0f;
    for (float sample : samples) loudest = std::max(loudest, std::abs(sample));
    return loudest;
}

// Points JACK and PulseAudio clients at servers that do not exist, for the life of the object.
class NoSoundServers {
  public:
    NoSoundServers() : jack_(qgetenv("JACK_DEFAULT_SERVER")), pulse_(qgetenv("PULSE_SERVER")) {
        qputenv("JACK_DEFAULT_SERVER", "oq-no-such-server");
        qputenv("PULSE_SERVER", "unix:/nonexistent/oq-no-such-socket");
    }
    ~NoSoundServers() {
        Restore("JACK_DEFAULT_SERVER", jack_);
        Restore("PULSE_SERVER", pulse_);
    }

  private:
    static void Restore(const char* name, const QByteArray& value) {
        if (value.isNull()) {
            qunsetenv(name);
        } else {
            qputenv(name, value);
        }
    }
    QByteArray jack_;
    QByteArray pulse_;
};

class NullSink : public AudioCaptureSink {
  public:
    void capture(const float*, int, int) noexcept override {}
};

}  // namespace

TEST(AudioEngine, PlaysThroughTheInjectedDeviceAtItsRateAndForgetsSoundsOnStop) {
    auto owned = std::make_unique<OfflineAudioDevice>(AudioStreamFormat{44100, 128, 2});
    OfflineAudioDevice& device = *owned;
    AudioEngine engine(std::move(owned));
    QSignalSpy notices(&engine, &AudioEngine::statusNotice);

    ASSERT_TRUE(engine.start());
    EXPECT_TRUE(device.isRunning());
    EXPECT_EQ(engine.outputDevice(), &device);
    EXPECT_EQ(engine.mixer().deviceRate(), 44100);
    EXPECT_EQ(engine.outputDescription(), "offline");
    EXPECT_EQ(notices.count(), 0);

    engine.mixer().start(3, ConstantSound(0.5f, 44100, 44100));
    EXPECT_NEAR(Loudest(device.pull(4)), 0.5f, 1e-3f);
    QTemporaryDir dir;
    const QString pad = dir.filePath("pad.wav");
    ASSERT_TRUE(WriteTestWave(pad, 44100, 1, 44100, [](long, int) { return 0.25f; }));
    ASSERT_TRUE(engine.channels().channel(60).setFileName(pad));
    ASSERT_TRUE(engine.channels().channel(60).start());
    QSignalSpy ended(&engine.channels(), &WaveChannels::playbackEnded);

    engine.stop();
    // Sounds cut off by the stop have ended, and the pads hear of it.
    EXPECT_FALSE(engine.channels().channel(60).isPlaying());
    ASSERT_EQ(ended.count(), 1);
    EXPECT_EQ(ended[0][0].toInt(), 60);
    EXPECT_FALSE(device.isRunning());
    EXPECT_FALSE(engine.isRunning());
    EXPECT_TRUE(engine.outputDescription().isEmpty());

    // The sound that played before the stop does not come back with the next start.
    ASSERT_TRUE(engine.restart());
    EXPECT_EQ(Loudest(device.pull(4)), 0.0f);
}

TEST(AudioEngine, FallsBackToSilenceWithANoticeWhenTheChosenDeviceIsMissing) {
    NoSoundServers noServers;
    struct Case {
        const char* api;
        const char* device;
        const char* reason;
    };
    const Case cases[] = {
        {"JACK", "", "no JACK server runs"},
        {"PulseAudio", "", "no PulseAudio server answers"},
        {"ALSA", "Orvelle Quindara no such card", "no output device"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.api);
        MemorySettingsStore settings;
        settings.setValue("Audio", "Api", c.api);
        settings.setValue("Audio", "OutputDevice", c.device);
        AudioEngine engine(settings);
        QSignalSpy notices(&engine, &AudioEngine::statusNotice);

        EXPECT_FALSE(engine.start());
        ASSERT_EQ(notices.count(), 1);
        const QString notice = notices.at(0).at(0).toString();
        EXPECT_TRUE(notice.startsWith("Sound device could not be opened (")) << notice;
        EXPECT_TRUE(notice.contains(c.reason)) << notice;
        EXPECT_TRUE(notice.endsWith("): playing silently")) << notice;
        EXPECT_EQ(engine.outputDescription(), "no sound device");
        ASSERT_NE(engine.outputDevice(), nullptr);
        EXPECT_TRUE(engine.outputDevice()->isRunning());
    }
    // Without their servers, JACK and PulseAudio list nothing.
    for (AudioApi api : {AudioApi::Jack, AudioApi::Pulse}) {
        EXPECT_TRUE(AudioOutputDeviceNames(api).isEmpty());
        EXPECT_TRUE(AudioInputDeviceNames(api).isEmpty());
    }
}

TEST(AudioEngine, OnTheNullDeviceSoundsStillEndAndReportAsOnASoundCard) {
    MemorySettingsStore settings;
    settings.setValue("Audio", "Api", "None");
    AudioEngine engine(settings);
    QSignalSpy notices(&engine, &AudioEngine::statusNotice);
    ASSERT_TRUE(engine.start());
    EXPECT_EQ(notices.count(), 0);  // no sound device was asked for
    EXPECT_EQ(engine.outputDescription(), "no sound device");

    QSignalSpy ended(&engine.channels(), &WaveChannels::playbackEnded);
    engine.mixer().start(2, ConstantSound(0.5f, 4800, 48000));  // 0.1 s
    ASSERT_TRUE(ended.wait(3000));
    EXPECT_EQ(ended.at(0).at(0).toInt(), kFirstPad + 2);
}

TEST(AudioEngine, RestartAppliesChangedSettingsAndCaptureFallsBackToSilence) {
    NoSoundServers noServers;
    MemorySettingsStore settings;
    settings.setValue("Audio", "Api", "None");
    settings.setValue("Audio", "PeriodFrames", "512");
    AudioEngine engine(settings);
    QSignalSpy notices(&engine, &AudioEngine::statusNotice);
    ASSERT_TRUE(engine.start());
    EXPECT_EQ(engine.outputDevice()->format().periodFrames, 512);

    NullSink sink;
    EXPECT_TRUE(engine.startCapture(sink, 1));
    ASSERT_NE(engine.inputDevice(), nullptr);
    EXPECT_EQ(engine.inputDevice()->format().channels, 1);
    EXPECT_EQ(notices.count(), 0);

    settings.setValue("Audio", "Api", "JACK");
    EXPECT_FALSE(engine.restart());
    EXPECT_EQ(notices.count(), 1);
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
