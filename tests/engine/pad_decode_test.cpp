// Pads whose files decode on the worker: the event loop keeps running, and a press made meanwhile
// sounds once the file is ready.
#include "components/audio/devices/offline_audio_device.h"
#include "components/audio/playback/engine_wave_channels.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "engine/input_dispatcher.h"
#include "engine/wave_playback.h"
#include "support/wave_files.h"

#include <QCoreApplication>
#include <QKeyEvent>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

#include <gtest/gtest.h>

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

struct PadDecodeTest : ::testing::Test {
    QTemporaryDir dir;
    Context context;
    ScriptedPrompts prompts;
    WaveMixer mixer{48000};
    EngineWaveChannels channels{mixer};
    OfflineAudioDevice device{AudioStreamFormat{48000, 256, 2}};
    LoopbackMidiOutput midiOut{{QStringLiteral("Out")}};
    WavePlayback waves{context, channels, prompts};
    InputDispatcher dispatcher{context, midiOut, waves};
    QSignalSpy loaded{&channels, &WaveChannels::loaded};

    void SetUp() override { device.start(mixer); }

    // A pad playing `file` in `mode`; the file is a minute of stereo, or bytes that are no sound.
    QString MakePad(int note, int mode, bool sound = true) {
        const QString file = dir.filePath(QStringLiteral("%1.wav").arg(note));
        if (sound) {
            EXPECT_TRUE(WriteTestWave(
                file, 48000, 2, 60 * 48000, [](long, int) { return 0.25f; }, true));
        } else {
            QFile bytes(file);
            EXPECT_TRUE(bytes.open(QIODevice::WriteOnly) && bytes.write(QByteArray(1 << 20, 'x')));
        }
        NoteSlot& slot = context.NoteSlots[note];
        slot.NoteFunction = "1";
        slot.WavePlayMode = QString::number(mode);
        slot.WaveLooped = mode >= 2 ? "True" : "False";
        slot.WaveVolume = slot.WavePan = slot.WaveFrequency = "0";
        slot.WaveFileName = file;
        slot.WaveAssigned = "True";
        return file;
    }
    bool Heard() {
        const std::vector<float>& period = device.pull();
        channels.collectEvents();
        return std::any_of(period.begin(), period.end(), [](float s) { return s != 0.0f; });
    }
};

}  // namespace

TEST_F(PadDecodeTest, TheEventLoopRunsWhileAFileDecodesAndAPressMadeMeanwhileSoundsAfter) {
    const QString file = MakePad(60, 0);
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

TEST_F(PadDecodeTest, AHeldPadReleasedMeanwhileStaysSilentAndAFailedDecodeIsReported) {
    MakePad(59, 2);
    const QString broken = MakePad(61, 1, false);
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
