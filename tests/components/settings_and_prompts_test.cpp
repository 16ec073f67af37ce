#include "components/prompts/qt_prompts.h"
#include "components/settings/qsettings_store.h"

#include <QApplication>
#include <QMessageBox>
#include <QPushButton>
#include <QTemporaryDir>
#include <QTimer>

#include <gtest/gtest.h>

TEST(QSettingsStoreTest, ValuesSurviveARestartAsTextInTheirGroups) {
    QTemporaryDir dir;
    const QString file = dir.filePath(QStringLiteral("settings.ini"));
    {
        QSettingsStore store(file);
        EXPECT_FALSE(store.contains("MIDI", "MIDI_Error_Check"));
        EXPECT_EQ(store.value("MIDI", "MIDI_Error_Check"), "")
            << "a missing key reads as empty text";
        EXPECT_EQ(store.value("Defaults", "MidiVelocity", "127"), "127");
        store.setValue("MIDI", "MIDI_OutputName", "Synth: Port 1");
        store.setValue("Defaults", "MidiVelocity", "abc");
    }
    QSettingsStore reopened(file);
    EXPECT_EQ(reopened.value("MIDI", "MIDI_OutputName"), "Synth: Port 1");
    EXPECT_EQ(reopened.value("Defaults", "MidiVelocity", "127"), "abc");
    EXPECT_FALSE(reopened.contains("Defaults", "MIDI_OutputName"));
}

TEST(QtPromptsTest, FiltersAndAnswers) {
    EXPECT_EQ(QtPrompts::QtFilter("Setup files (*.set) |*.set"), "Setup files (*.set)");
    EXPECT_EQ(QtPrompts::QtFilter("Wave|*.wav|MP3 files (*.mp3)|*.mp3"),
              "Wave (*.wav);;MP3 files (*.mp3)");

    // A real box: its default button is the answer Enter gives; the close box gives No.
    QtPrompts prompts;
    const MessagePrompt question{"Orvelle Quindara",
                                 "This file already exists. Replace existing file?",
                                 PromptIcon::Question,
                                 {PromptButton::Yes, PromptButton::No},
                                 PromptButton::No};
    auto pressOnOpenBox = [](int key) {
        QTimer::singleShot(0, [key] {
            auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
            ASSERT_NE(box, nullptr);
            EXPECT_EQ(box->windowTitle(), "Orvelle Quindara");
            EXPECT_EQ(box->icon(), QMessageBox::Question);
            if (key == Qt::Key_Escape) {
                box->reject();
            } else {
                box->defaultButton()->click();
            }
        });
    };
    pressOnOpenBox(Qt::Key_Return);
    EXPECT_EQ(prompts.message(question), PromptButton::No);
    pressOnOpenBox(Qt::Key_Escape);
    EXPECT_EQ(prompts.message(question), PromptButton::No);
}
