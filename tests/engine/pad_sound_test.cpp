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

#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <cmath>

namespace {

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
