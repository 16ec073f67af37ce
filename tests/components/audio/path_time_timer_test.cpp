#include "components/audio/path_and_time_text.h"
#include "components/audio/precise_timer.h"

#include <QElapsedTimer>
#include <QTest>

#include <gtest/gtest.h>

TEST(PathAndTimeText, PartsOfPathsAndTimes) {
    EXPECT_EQ(FileNamePart("/home/me/Week1.set"), "Week1.set");
    EXPECT_EQ(FileNamePart("Week1.set"), "Week1.set");
    EXPECT_EQ(FileNamePart("C:\\Music\\Loop.MP3"), "Loop.MP3");
    EXPECT_EQ(ExtensionPart("/music/Loop.MP3"), ".MP3");
    EXPECT_EQ(ExtensionPart("/music.d/Loop"), "");
    EXPECT_EQ(ExtensionPart("/music/a.b.wav"), ".wav");
    EXPECT_EQ(FolderPart("/music/Loop.mp3"), "/music/");
    EXPECT_EQ(FolderPart("Loop.mp3"), "");
    const QString path = "/home/zoë/Musik/Glockenspiel ♪.wav";
    EXPECT_EQ(FolderPart(path) + FileNamePart(path), path);

    EXPECT_EQ(TimeText(0), "0:00.000");
    EXPECT_EQ(TimeText(62345), "1:02.345");
    EXPECT_EQ(TimeText(59999), "0:59.999");
    EXPECT_EQ(TimeText(600000), "10:00.000");
    EXPECT_EQ(TimeText(-5), "0:00.000");
}

TEST(PreciseTimerTest, TicksStayOnTheirGridAndStopWhenDisabled) {
    PreciseTimer timer;
    timer.setInterval(20);
    QList<qint64> ticks;
    QElapsedTimer clock;
    QObject::connect(&timer, &PreciseTimer::tick, [&] { ticks << clock.elapsed(); });
    clock.start();
    timer.setEnabled(true);
    ASSERT_TRUE(QTest::qWaitFor([&] { return ticks.size() >= 10; }, 5000));
    timer.setEnabled(false);
    // Never ahead of the beat.
    for (int i = 0; i < 10; ++i) EXPECT_GE(ticks[i], 20 * (i + 1)) << i;
    const qsizetype count = ticks.size();
    QTest::qWait(60);
    EXPECT_EQ(ticks.size(), count);
}
