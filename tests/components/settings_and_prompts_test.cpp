#include "components/prompts/qt_prompts.h"
#include "components/settings/qsettings_store.h"

#include <QApplication>
#include <QTemporaryDir>
#include <QTest>
#include <QTimer>

#include <gtest/gtest.h>

TEST(QSettingsStoreTest, ValuesSurviveARestartAsTextInTheirGroups) {
    QTemporaryDir dir;
    const QString file = dir.filePath(QStringLiteral("settings.ini"));
    {
        QSettingsStore store(file);
        EXPECT_EQ(store.value("Defaults", "MidiVelocity", "127"), "127") << "missing: the default";
        store.setValue("MIDI", "MIDI_OutputName", "Synth: Port 1");
        store.setValue("Defaults", "MidiVelocity", "abc");
    }
    QSettingsStore reopened(file);
    EXPECT_EQ(reopened.value("MIDI", "MIDI_OutputName"), "Synth: Port 1");
    EXPECT_EQ(reopened.value("Defaults", "MidiVelocity", "127"), "abc");
    EXPECT_FALSE(reopened.contains("Defaults", "MIDI_OutputName"));
}

TEST(QtPromptsTest, FiltersAndEnterGivesTheDefaultAnswer) {
    EXPECT_EQ(QtPrompts::QtFilter("Setup files (*.set) |*.set"), "Setup files (*.set)");
    EXPECT_EQ(QtPrompts::QtFilter("Wave|*.wav|MP3 files (*.mp3)|*.mp3"),
              "Wave (*.wav);;MP3 files (*.mp3)");

    // A real box: Enter gives its default button (Escape and the close box: qt_prompts_test).
    QTimer::singleShot(0,
                       [] { QTest::keyClick(QApplication::activeModalWidget(), Qt::Key_Return); });
    EXPECT_EQ(QtPrompts().message({"Orvelle Quindara",
                                   "Replace existing file?",
                                   PromptIcon::Question,
                                   {PromptButton::Yes, PromptButton::No},
                                   PromptButton::Yes}),
              PromptButton::Yes);
}
