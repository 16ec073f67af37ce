// Pads played end to end: the dispatcher and wave playback over the real mixer, rendered on the
// offline device.
#include "components/audio/devices/offline_audio_device.h"
#include "components/audio/playback/engine_wave_channels.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "components/settings/memory_settings_store.h"
#include "engine/gm_names.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"
#include "engine/wave_playback.h"
#include "support/wave_files.h"

#include <QCoreApplication>
#include <QFile>
#include <QKeyEvent>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

#include <gtest/gtest.h>

#include <cmath>

namespace {

// Notes whether the pad's file was still decoding when a key event reached it.
struct KeyCatcher : QObject {
    MixerWaveChannel* channel = nullptr;
    bool handledDuringDecode = false;
    bool event(QEvent* event) override {
        if (event->type() == QEvent::KeyPress) handledDuringDecode = channel->isDecoding();
        return QObject::event(event);
    }
};

struct PadSoundTest : ::testing::Test {
    QTemporaryDir dir;
    Context context;
    ScriptedPrompts prompts;
    GmNames names{QString(), QString(), prompts};
    WaveMixer mixer{48000};
    EngineWaveChannels channels{mixer};
    OfflineAudioDevice device{AudioStreamFormat{48000, 256, 2}};
    LoopbackMidiOutput midiOut{{QStringLiteral("Out")}};
    WavePlayback waves{context, channels, prompts};
    InputDispatcher dispatcher{context, midiOut, waves};
    QString drum;
    QSignalSpy loaded{&channels, &WaveChannels::loaded};

    // A minute of stereo: long enough that its decode is still under way after a press.
    QString LongSound(const char* name) {
        const QString file = dir.filePath(QLatin1String(name));
        EXPECT_TRUE(WriteTestWave(
            file, 48000, 2, 60 * 48000, [](long, int) { return 0.25f; }, true));
        return file;
    }

    void SetUp() override {
        GetStartupDefaults(context, MemorySettingsStore());
        InitializeAllMidiNotes(context, names, channels);
        device.start(mixer);
        drum = dir.filePath("drum.wav");
        // 0.1 s of a 1 kHz sine at the file's own 44.1 kHz.
        ASSERT_TRUE(WriteTestWave(drum, 44100, 1, 4410, [](long f, int) {
            return 0.5f * static_cast<float>(std::sin(2 * M_PI * 1000 * f / 44100.0));
        }));
    }

    void MakePad(int note, int mode, const QString& file) {
        NoteSlot& slot = context.NoteSlots[note];
        slot.NoteFunction = "1";
        slot.WavePlayMode = QString::number(mode);
        slot.WaveLooped = mode >= 2 ? "True" : "False";
        slot.WaveFileName = file;
        slot.WaveAssigned = "True";
    }

    // Renders one period and tells whether anything sounded in it.
    bool Heard() {
        const std::vector<float>& period = device.pull();
        channels.collectEvents();
        for (float sample : period) {
            if (sample != 0.0f) return true;
        }
        return false;
    }
    bool HeardWithin(int periods) {
        for (int i = 0; i < periods; ++i) {
            if (Heard()) return true;
        }
        return false;
    }
};

}  // namespace

TEST_F(PadSoundTest, APadSoundsInTheVeryNextPeriod) {
    MakePad(60, 0, drum);
    EXPECT_FALSE(Heard());
    dispatcher.ProcessInputData(144, 60, 100);
    EXPECT_TRUE(Heard());
    EXPECT_EQ(context.NoteSlots[60].WavePlaying, "True");
    // 0.1 s of sound is 19 periods at 48 kHz; then the end notice clears the flag.
    for (int i = 0; i < 25; ++i) Heard();
    EXPECT_FALSE(Heard());
    EXPECT_EQ(context.NoteSlots[60].WavePlaying, "False");
}

TEST_F(PadSoundTest, AllFourPlayModesHeardEndToEnd) {
    MakePad(57, 0, drum);  // once, retriggers
    MakePad(58, 1, drum);  // once, no retrigger
    MakePad(59, 2, drum);  // looped while held
    MakePad(60, 3, drum);  // looped toggle

    dispatcher.ProcessInputData(144, 59, 100);
    for (int i = 0; i < 40; ++i) ASSERT_TRUE(Heard()) << "a held loop keeps sounding, period " << i;
    dispatcher.ProcessInputData(128, 59, 0);
    Heard();  // the stop ramp
    EXPECT_FALSE(Heard());

    dispatcher.ProcessInputData(144, 60, 100);
    dispatcher.ProcessInputData(128, 60, 0);
    for (int i = 0; i < 40; ++i) ASSERT_TRUE(Heard()) << "a toggled loop ignores the release";
    dispatcher.ProcessInputData(144, 60, 100);
    Heard();
    EXPECT_FALSE(Heard());
    EXPECT_EQ(context.NoteSlots[60].WavePlaying, "False");

    dispatcher.ProcessInputData(144, 58, 100);
    for (int i = 0; i < 10; ++i) Heard();
    dispatcher.ProcessInputData(144, 58, 100);  // ignored while it sounds
    for (int i = 0; i < 15; ++i) Heard();
    EXPECT_FALSE(Heard()) << "ended after its 0.1 s, not restarted";
    dispatcher.ProcessInputData(128, 58, 0);
    EXPECT_FALSE(HeardWithin(3)) << "a release never restarts it";

    dispatcher.ProcessInputData(144, 57, 100);
    for (int i = 0; i < 10; ++i) Heard();
    dispatcher.ProcessInputData(144, 57, 100);  // restarts from the beginning
    for (int i = 0; i < 15; ++i)
        ASSERT_TRUE(Heard()) << "still sounding after the restart, period " << i;
    EXPECT_TRUE(prompts.shownMessages.isEmpty());
}

// Pads whose files decode on the worker: the event loop keeps running, and a press made meanwhile
// sounds once the file is ready.
TEST_F(PadSoundTest, TheEventLoopRunsWhileAFileDecodesAndAPressMadeMeanwhileSoundsAfter) {
    const QString file = LongSound("60.wav");
    MakePad(60, 0, file);
    KeyCatcher catcher;
    catcher.channel = &channels.channel(60);
    ASSERT_TRUE(channels.channel(60).load(file));  // as opening a setup file does
    QCoreApplication::postEvent(&catcher, new QKeyEvent(QEvent::KeyPress, Qt::Key_A, {}));
    dispatcher.ProcessInputData(144, 60, 100);
    EXPECT_FALSE(Heard());

    ASSERT_TRUE(QTest::qWaitFor([&] { return loaded.size() == 1; }, 20000));
    EXPECT_TRUE(catcher.handledDuringDecode) << "the key waited for the decode";
    EXPECT_EQ(loaded[0], QVariantList({60, true, QString()}));
    EXPECT_TRUE(Heard());
    EXPECT_TRUE(prompts.shownMessages.isEmpty());
}

TEST_F(PadSoundTest, AHeldPadReleasedMeanwhileStaysSilentAndAFailedDecodeIsReported) {
    MakePad(59, 2, LongSound("59.wav"));
    const QString broken = dir.filePath("61.wav");
    QFile bytes(broken);
    ASSERT_TRUE(bytes.open(QIODevice::WriteOnly) && bytes.write(QByteArray(1 << 20, 'x')));
    bytes.close();
    MakePad(61, 1, broken);
    dispatcher.ProcessInputData(144, 59, 100);  // decodes at the press: the file is large
    dispatcher.ProcessInputData(128, 59, 0);
    dispatcher.ProcessInputData(144, 61, 100);
    EXPECT_TRUE(channels.channel(59).isDecoding() && channels.channel(61).isDecoding());

    ASSERT_TRUE(QTest::qWaitFor([&] { return loaded.size() == 2; }, 20000));
    EXPECT_FALSE(Heard() || Heard());
    EXPECT_EQ(context.NoteSlots[61].WavePlaying, "False");
    QCoreApplication::sendPostedEvents();
    ASSERT_EQ(prompts.shownMessages.size(), 1);
    EXPECT_TRUE(prompts.shownMessages[0].text.startsWith("Problem playing specified audio file"));
    EXPECT_TRUE(prompts.shownMessages[0].text.contains(broken));
}
