#include "components/audio/audio_setup_dialog.h"
#include "components/audio/audio_engine.h"
#include "components/audio/offline_audio_device.h"
#include "components/midi/jack_probe.h"
#include "components/settings/memory_settings_store.h"

#include <QComboBox>
#include <QLabel>
#include <QPushButton>
#include <QTest>

#include <gtest/gtest.h>

#include <cmath>

namespace {

QComboBox* List(const QDialog& dialog, const char* name) {
    return dialog.findChild<QComboBox*>(QLatin1String(name));
}

QPushButton* Button(const QDialog& dialog, const char* name) {
    return dialog.findChild<QPushButton*>(QLatin1String(name));
}

QString Latency(const QDialog& dialog) {
    return dialog.findChild<QLabel*>(QStringLiteral("lblLatency"))->text();
}

void Choose(QComboBox* list, const QString& text) {
    const int index = list->findText(text);
    ASSERT_GE(index, 0) << text;
    list->setCurrentIndex(index);
}

QString Stored(const SettingsStore& settings, const char* key) {
    return settings.value(QStringLiteral("Audio"), QLatin1String(key), QStringLiteral("<none>"));
}

struct OfflineEngine {
    explicit OfflineEngine(AudioStreamFormat format) {
        auto output = std::make_unique<OfflineAudioDevice>(format);
        device = output.get();
        engine = std::make_unique<AudioEngine>(std::move(output));
        engine->start();
    }
    OfflineAudioDevice* device;
    std::unique_ptr<AudioEngine> engine;
};

}  // namespace

TEST(AudioSetupDialogTest, LatencyFollowsThePeriodAtTheEnginesRate) {
    MemorySettingsStore settings;
    OfflineEngine at48{{48000, 256, 2}};
    AudioSetupDialog dialog(*at48.engine, settings);
    QComboBox* period = List(dialog, "ComboPeriod");
    EXPECT_EQ(period->currentText(), "256");
    EXPECT_EQ(Latency(dialog), "5.3 ms");
    Choose(period, "1024");
    EXPECT_EQ(Latency(dialog), "21.3 ms");

    OfflineEngine at44{{44100, 256, 2}};
    settings.setValue(QStringLiteral("Audio"), QStringLiteral("PeriodFrames"), "2048");
    AudioSetupDialog slower(*at44.engine, settings);
    EXPECT_EQ(Latency(slower), "46.4 ms");

    // A stopped engine has no rate: 48 kHz is assumed. A period set by hand stays on offer.
    at44.engine->stop();
    settings.setValue(QStringLiteral("Audio"), QStringLiteral("PeriodFrames"), "300");
    AudioSetupDialog stopped(*at44.engine, settings);
    EXPECT_EQ(List(stopped, "ComboPeriod")->currentText(), "300");
    EXPECT_EQ(Latency(stopped), "6.3 ms");
}

TEST(AudioSetupDialogTest, OkStoresTheChoiceAndRestartsTheEngineCancelDoesNeither) {
    MemorySettingsStore settings;
    settings.setValue(QStringLiteral("Audio"), QStringLiteral("Api"), "None");
    AudioEngine engine(settings);
    engine.start();
    const AudioOutputDevice* before = engine.outputDevice();

    {
        AudioSetupDialog dialog(engine, settings);
        dialog.show();
        Choose(List(dialog, "ComboAudioAPI"), "Automatic");
        Choose(List(dialog, "ComboPeriod"), "2048");
        QTest::keyClick(&dialog, Qt::Key_Escape);
    }
    EXPECT_EQ(Stored(settings, "Api"), "None");
    EXPECT_EQ(Stored(settings, "PeriodFrames"), "<none>");
    EXPECT_EQ(engine.outputDevice(), before);

    AudioSetupDialog dialog(engine, settings);
    dialog.show();
    EXPECT_EQ(List(dialog, "ComboAudioAPI")->currentText(), "None");
    EXPECT_FALSE(List(dialog, "ComboAudioOUT")->isEnabled());
    Choose(List(dialog, "ComboPeriod"), "512");
    QTest::mouseClick(Button(dialog, "cmdOK"), Qt::LeftButton);

    EXPECT_EQ(Stored(settings, "Api"), "None");
    EXPECT_EQ(Stored(settings, "OutputDevice"), "");
    EXPECT_EQ(Stored(settings, "InputDevice"), "");
    EXPECT_EQ(Stored(settings, "PeriodFrames"), "512");
    ASSERT_TRUE(engine.isRunning());
    EXPECT_EQ(engine.outputDescription(), "no sound device");
    EXPECT_EQ(engine.outputDevice()->format().periodFrames, 512);
    EXPECT_EQ(dialog.result(), QDialog::Accepted);
}

// A tone of 0.3 s, 440 Hz, at half level, on both sides alike, then silence.
TEST(AudioSetupDialogTest, TestPlaysAShortToneThroughTheRunningEngine) {
    MemorySettingsStore settings;
    OfflineEngine offline{{48000, 256, 2}};
    AudioSetupDialog dialog(*offline.engine, settings);
    QTest::mouseClick(Button(dialog, "cmdTestAudio"), Qt::LeftButton);
    const std::vector<float> stereo = offline.device->pull(80);

    int lastSounding = -1;
    int signChanges = 0;
    float loudest = 0.0f;
    for (int frame = 0; frame + 1 < static_cast<int>(stereo.size() / 2); ++frame) {
        const float left = stereo[2 * frame];
        ASSERT_FLOAT_EQ(left, stereo[2 * frame + 1]) << frame;
        loudest = std::max(loudest, std::abs(left));
        if (std::abs(left) > 1e-4f) lastSounding = frame;
        if ((left < 0.0f) != (stereo[2 * frame + 2] < 0.0f)) ++signChanges;
    }
    EXPECT_NEAR(loudest, 0.5f, 0.01f);
    EXPECT_NEAR(lastSounding, 14400, 10);
    EXPECT_NEAR(signChanges, 2 * 132, 4);
    EXPECT_EQ(Stored(settings, "Api"), "<none>");
}

TEST(AudioSetupDialogTest, JackOffersTheServersDevicesAndOkPlaysThroughIt) {
    if (!JackServerRunning()) {
        if (qgetenv("CI") == "true") FAIL() << "CI runs a JACK server, but none answers";
        GTEST_SKIP() << "no JACK server (source scripts/sound-servers.sh, start_sound_servers)";
    }
    MemorySettingsStore settings;
    settings.setValue(QStringLiteral("Audio"), QStringLiteral("Api"), "None");
    AudioEngine engine(settings);
    engine.start();
    AudioSetupDialog dialog(engine, settings);
    QComboBox* output = List(dialog, "ComboAudioOUT");
    Choose(List(dialog, "ComboAudioAPI"), "JACK");
    ASSERT_TRUE(output->isEnabled());
    ASSERT_GE(output->count(), 2);  // "Default" and the server's own
    EXPECT_EQ(output->itemText(0), "Default");
    const QString device = output->itemText(1);
    output->setCurrentIndex(1);
    QTest::mouseClick(Button(dialog, "cmdOK"), Qt::LeftButton);

    EXPECT_EQ(Stored(settings, "Api"), "JACK");
    EXPECT_EQ(Stored(settings, "OutputDevice"), device);
    EXPECT_TRUE(engine.outputDescription().startsWith("JACK 48 kHz")) << engine.outputDescription();
}
