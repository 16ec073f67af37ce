#pragma once

#include "app/application.h"
#include "app/main_window.h"
#include "app/pad_strip.h"
#include "components/audio/audio_engine.h"
#include "components/audio/devices/offline_audio_device.h"
#include "components/audio/playback/recording_wave_channels.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "components/settings/memory_settings_store.h"
#include "components/widgets/rotary_knob.h"
#include "support/wave_files.h"

#include <QApplication>
#include <QDialog>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>
#include <QTimer>

#include <gtest/gtest.h>

#include <memory>

// The whole program over test backends: loopback MIDI, recording channels, scripted prompts.
struct ProgramTest : ::testing::Test {
    MemorySettingsStore* settings = new MemorySettingsStore;
    ScriptedPrompts* prompts = new ScriptedPrompts;
    RecordingWaveChannels* channels = new RecordingWaveChannels;
    LoopbackMidiInput* midiIn = new LoopbackMidiInput({QStringLiteral("Keys")});
    LoopbackMidiOutput* midiOut =
        new LoopbackMidiOutput({QStringLiteral("Synth"), QStringLiteral("Drums")});
    std::unique_ptr<Application> program;
    // The MIDI setup dialog that start-up shows on a first run is cancelled as soon as it opens.
    int midiSetupDialogsShown = 0;
    QTimer dialogCanceller;
    std::unique_ptr<AudioEngine> audio;  // when set, the pads play through it

    void Build() {
        Backends backends;
        backends.audio = std::move(audio);
        backends.settings.reset(settings);
        backends.prompts.reset(prompts);
        backends.channels.reset(channels);
        backends.midiIn.reset(midiIn);
        backends.midiOut.reset(midiOut);
        backends.instrumentList = QStringLiteral(OQ_SOURCE_DATA_DIR "/genmidi.txt");
        backends.drumList = QStringLiteral(OQ_SOURCE_DATA_DIR "/genmididrums.txt");
        backends.splashMilliseconds = 1;
        program = std::make_unique<Application>(std::move(backends));
        QObject::connect(&dialogCanceller, &QTimer::timeout, [this] {
            auto* dialog = qobject_cast<QDialog*>(QApplication::activeModalWidget());
            if (dialog && dialog->objectName() == "frmMIDISETUP") {
                ++midiSetupDialogsShown;
                dialog->reject();
            }
        });
        dialogCanceller.start(10);
    }

    void StoreDevices(int in, int out) {
        settings->setValue("MIDI", "MIDI_Error_Check", "14");  // "Keys" + "Synth" + "Drums"
        settings->setValue("MIDI", "MIDI_Input", QString::number(in));
        settings->setValue("MIDI", "MIDI_Output", QString::number(out));
    }
};
