#include "program_fixture.h"

#include "app/pad_strip.h"
#include "support/wave_files.h"

#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

TEST_F(ProgramTest, FirstRunAsksForDevicesAndStartsWithTheDefaultTable) {
    Build();
    program->Start();
    EXPECT_EQ(program->window().windowTitle(), "Tarvik Radio - Orvelle Quindara - Untitled");
    ASSERT_EQ(prompts->shownMessages.size(), 1);
    EXPECT_EQ(prompts->shownMessages[0].title, "MIDI Settings change detected");
    EXPECT_EQ(prompts->shownMessages[0].text, "Please select your MIDI devices now...");
    EXPECT_EQ(midiSetupDialogsShown, 1) << "then the MIDI setup dialog";
    EXPECT_FALSE(midiIn->isOpen());
    EXPECT_FALSE(midiOut->isOpen());
    EXPECT_EQ(program->context().NoteSlots[60].Description, "MIDI Note C 60  Acoustic Grand Piano");
    EXPECT_EQ(program->context().NoteSlots[127].MidiVelocity, "127");
}

TEST_F(ProgramTest, StoredDevicesOpenAndMidiInPlaysThePads) {
    StoreDevices(0, 1);
    settings->setValue("Defaults", "MidiChannel", "2");
    Build();
    program->Start();
    EXPECT_TRUE(prompts->shownMessages.isEmpty());
    ASSERT_TRUE(midiIn->isOpen());
    ASSERT_TRUE(midiOut->isOpen());
    EXPECT_EQ(midiOut->deviceIndex(), 1);
    ASSERT_EQ(midiOut->sent.size(), 1u);
    EXPECT_EQ(midiOut->sent[0], (ShortMessage{178, 7, 100}))
        << "main volume on the default channel";

    midiIn->inject({144, 60, 90});
    ASSERT_TRUE(QTest::qWaitFor([&] { return program->window().KeyShownPressed(60); }, 5000));
    EXPECT_EQ(midiOut->sent.back(), (ShortMessage{146, 60, 127}));
}

TEST_F(ProgramTest, ClosingTheWindowReleasesChannelsAndClosesBothPorts) {
    StoreDevices(0, 0);
    Build();
    program->Start();
    channels->log.clear();
    program->window().close();
    EXPECT_FALSE(midiIn->isOpen());
    EXPECT_FALSE(midiOut->isOpen());
    EXPECT_EQ(channels->log.size(), 16);
    EXPECT_EQ(channels->log.first(), "57 close");
    program.reset();  // a second shutdown from the destructor does nothing more
    EXPECT_EQ(channels->log.size(), 16);
}

TEST_F(ProgramTest, AKeyOnTheMidiKeyboardPlaysAWavePadThroughTheAudioEngine) {
    auto owned = std::make_unique<OfflineAudioDevice>(AudioStreamFormat{48000, 256, 2});
    OfflineAudioDevice& device = *owned;
    audio = std::make_unique<AudioEngine>(std::move(owned));
    StoreDevices(0, 0);
    Build();
    program->Start();
    ASSERT_TRUE(device.isRunning());
    EXPECT_EQ(program->window().DeviceSummary(), "offline");

    QTemporaryDir dir;
    const QString hit = dir.filePath("hit.wav");
    ASSERT_TRUE(WriteTestWave(hit, 48000, 1, 4800, [](long, int) { return 0.5f; }));
    NoteSlot& slot = program->context().NoteSlots[64];
    slot.NoteFunction = "1";
    slot.WaveFileName = hit;
    slot.WaveAssigned = "True";

    midiIn->inject({144, 64, 100});
    ASSERT_TRUE(QTest::qWaitFor([&] { return slot.WavePlaying == "True"; }, 5000));
    const std::vector<float>& period = device.pull();
    EXPECT_GT(period[0], 0.0f) << "heard in the very next period";
    EXPECT_FLOAT_EQ(period[200], 0.5f);

    // The 0.1 s sound ends by itself and the pad hears of it.
    device.pull(20);
    ASSERT_TRUE(QTest::qWaitFor([&] { return slot.WavePlaying == "False"; }, 5000));

    program->window().close();
    EXPECT_FALSE(device.isRunning()) << "shutdown stops the engine";
}
