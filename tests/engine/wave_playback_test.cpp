#include "dispatch_fixture.h"

#include <QCoreApplication>

namespace {

struct WavePlaybackTest : DispatchTest {
    // The boxes shown so far; a failure's box comes once the current event is done.
    qsizetype Boxes() {
        QCoreApplication::sendPostedEvents();
        return prompts.shownMessages.size();
    }
};

}  // namespace

TEST_F(WavePlaybackTest, StartsWithTheSlotsSettingsAndStopsOnASecondCall) {
    NoteSlot& slot = MakeWavePad(66, "2");
    slot.WaveFrequency = "22050";
    slot.WaveVolume = "-1500";
    slot.WavePan = "-10000";
    waves.PlayWave(66);
    EXPECT_EQ(channels.log,
              QStringList({"66 file /sounds/hit.wav", "66 frequency 22050", "66 looping on",
                           "66 volume -1500", "66 pan -10000", "66 start"}));
    EXPECT_EQ(Playing(66), "True");
    waves.PlayWave(66);
    EXPECT_FALSE(Sounding(66));
    EXPECT_EQ(Playing(66), "False");
    EXPECT_EQ(channels.log.last(), "66 stop");
}

TEST_F(WavePlaybackTest, UnassignedPadsStaySilentAndQuiet) {
    NoteSlot& slot = MakeWavePad(60, "0");
    slot.WaveAssigned = "False";
    waves.PlayWave(60);
    waves.PlayWave(30);  // not a pad
    waves.StopWave(30);
    EXPECT_TRUE(channels.log.isEmpty());
    EXPECT_EQ(Boxes(), 0);
}

TEST_F(WavePlaybackTest, AFailedStartIsReportedOnceAndTheOncePadTriesAgainLater) {
    MakeWavePad(60, "1", "/sounds/gone.wav");
    channels.channel(60).unloadableFiles << "/sounds/gone.wav";
    dispatcher.ProcessInputData(144, 60, 100);
    ASSERT_EQ(Boxes(), 1);
    EXPECT_TRUE(prompts.shownMessages[0].text.startsWith("Problem playing specified audio file"));
    EXPECT_TRUE(prompts.shownMessages[0].text.contains("/sounds/gone.wav"));
    EXPECT_EQ(prompts.shownMessages[0].title, "Orvelle Quindara");
    EXPECT_EQ(prompts.shownMessages[0].icon, PromptIcon::Critical);
    EXPECT_FALSE(Sounding(60));
    EXPECT_EQ(Playing(60), "False");

    // The file is back: the next press plays.
    channels.channel(60).unloadableFiles.clear();
    dispatcher.ProcessInputData(144, 60, 100);
    EXPECT_TRUE(Sounding(60));
    EXPECT_EQ(Boxes(), 1);

    // A start that the channel refuses is a failure too.
    MakeWavePad(61, "0");
    channels.channel(61).failStart = true;
    waves.PlayWave(61);
    EXPECT_EQ(Boxes(), 2);
    EXPECT_EQ(Playing(61), "False");
}

TEST_F(WavePlaybackTest, FieldsThatAreNotNumbersFailInsteadOfPlayingAtZero) {
    NoteSlot& slot = MakeWavePad(63, "0");
    slot.WaveVolume = "abc";
    waves.PlayWave(63);
    EXPECT_EQ(Boxes(), 1);
    EXPECT_FALSE(Sounding(63));
    // What was set before the bad field stays set; nothing after it is.
    EXPECT_EQ(channels.log,
              QStringList({"63 file /sounds/hit.wav", "63 frequency 0", "63 looping off"}));

    slot.WaveVolume = "0";
    slot.WaveLooped = "maybe";
    waves.PlayWave(63);
    EXPECT_EQ(Boxes(), 2);
    EXPECT_EQ(Playing(63), "False");
}

TEST_F(WavePlaybackTest, StopAndAllSoundsOffTouchOnlySoundingPads) {
    for (int note : {57, 60, 72}) {
        MakeWavePad(note, "2");
        waves.PlayWave(note);
    }
    MakeWavePad(65, "2");
    context.NoteSlots[65].WavePlaying = "True";  // stale flag, silent channel
    waves.StopWave(65);
    EXPECT_EQ(Playing(65), "True") << "a silent channel changes nothing";

    channels.log.clear();
    waves.AllWaveSoundsOff();
    EXPECT_EQ(channels.log, QStringList({"57 stop", "60 stop", "72 stop"}));
    for (int note : {57, 60, 72}) {
        EXPECT_FALSE(Sounding(note));
        EXPECT_EQ(Playing(note), "False");
    }
}
