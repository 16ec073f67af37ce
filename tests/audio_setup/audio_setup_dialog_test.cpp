#include "audio_setup/audio_setup_dialog.h"
#include "components/audio/audio_engine.h"
#include "components/audio/devices/offline_audio_device.h"
#include "components/servers/jack_probe.h"
#include "components/settings/memory_settings_store.h"
#include "support/sound_servers.h"

#include "support/capture_signals.h"

#include <QComboBox>
#include <QLabel>
#include <QPushButton>
#include <QTest>

#include <gtest/gtest.h>

namespace {

QComboBox* List(const QDialog& dialog, const char* name) {
    return dialog.findChild<QComboBox*>(QLatin1String(name));
}

void ClickOk(const QDialog& dialog) {
    QTest::mouseClick(dialog.findChild<QPushButton*>(QStringLiteral("cmdOK")), Qt::LeftButton);
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

void Store(SettingsStore& settings, const char* key, const QString& text) {
    settings.setValue(QStringLiteral("Audio"), QLatin1String(key), text);
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
    OfflineEngine at44{{44100, 256, 2}};
    AudioSetupDialog dialog(*at44.engine, settings);
    Choose(List(dialog, "ComboPeriod"), "2048");
    EXPECT_EQ(Latency(dialog), "46.4 ms");
    at44.engine->stop();  // a stopped engine has no rate: 48 kHz is assumed
    EXPECT_EQ(Latency(AudioSetupDialog(*at44.engine, settings)), "5.3 ms");
}

TEST(AudioSetupDialogTest, OkStoresTheChoiceAndRestartsTheEngineCancelDoesNeither) {
    MemorySettingsStore settings;
    Store(settings, "Api", "None");
    Store(settings, "PeriodFrames", "300");  // set by hand, so not among the choices
    AudioEngine engine(settings);
    engine.start();
    const AudioOutputDevice* before = engine.outputDevice();
    {
        AudioSetupDialog dialog(engine, settings);
        dialog.show();
        EXPECT_EQ(List(dialog, "ComboPeriod")->currentText(), "300");
        Choose(List(dialog, "ComboAudioAPI"), "Automatic");
        Choose(List(dialog, "ComboPeriod"), "2048");
        QTest::keyClick(&dialog, Qt::Key_Escape);
    }
    EXPECT_EQ(Stored(settings, "PeriodFrames"), "300");
    EXPECT_EQ(engine.outputDevice(), before);

    AudioSetupDialog dialog(engine, settings);
    dialog.show();
    EXPECT_FALSE(List(dialog, "ComboAudioOUT")->isEnabled());
    Choose(List(dialog, "ComboPeriod"), "512");
    ClickOk(dialog);
    EXPECT_EQ(Stored(settings, "Api"), "None");
    EXPECT_EQ(Stored(settings, "PeriodFrames"), "512");
    ASSERT_TRUE(engine.isRunning());
    EXPECT_EQ(engine.outputDevice()->format().periodFrames, 512);
}

TEST(AudioSetupDialogTest, TestPlaysAShortToneThroughTheRunningEngine) {
    MemorySettingsStore settings;
    OfflineEngine offline{{48000, 256, 2}};
    AudioSetupDialog dialog(*offline.engine, settings);
    QTest::mouseClick(dialog.findChild<QPushButton*>(QStringLiteral("cmdTestAudio")),
                      Qt::LeftButton);
    // 0.3 s of 440 Hz at half level on both sides, with 10 ms ramps at its ends, then silence.
    const ReadWave played{48000, 2, offline.device->pull(80)};
    for (int side : {0, 1}) {
        EXPECT_LT(Deviation(played, side, 0.5, 440, 480, 13920), 1e-4) << side;
        EXPECT_EQ(Deviation(played, side, 0, 0, 14400, played.frames()), 0) << side;
    }
    EXPECT_EQ(Stored(settings, "Api"), "<none>");
}

TEST(AudioSetupDialogTest, JackOffersTheServersDevicesAndOkPlaysThroughIt) {
    REQUIRE_SOUND_SERVER(JackServerRunning(), "JACK");
    MemorySettingsStore settings;
    Store(settings, "Api", "None");
    AudioEngine engine(settings);
    engine.start();
    AudioSetupDialog dialog(engine, settings);
    QComboBox* output = List(dialog, "ComboAudioOUT");
    Choose(List(dialog, "ComboAudioAPI"), "JACK");
    ASSERT_TRUE(output->isEnabled());
    ASSERT_GE(output->count(), 2);  // "Default" and the server's own
    const QString device = output->itemText(1);
    output->setCurrentIndex(1);
    ClickOk(dialog);

    EXPECT_EQ(Stored(settings, "Api"), "JACK");
    EXPECT_EQ(Stored(settings, "OutputDevice"), device);
    EXPECT_TRUE(engine.outputDescription().startsWith("JACK 48 kHz")) << engine.outputDescription();
}
