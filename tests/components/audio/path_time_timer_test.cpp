#include "base/path_and_time_text.h"
#include "components/timing/precise_timer.h"

#include <QElapsedTimer>
#include <QTest>

#include <gtest/gtest.h>

TEST(PathAndTimeText, PartsOfPathsAndTimes) {
    EXPECT_EQ(FileNamePart("C:\\Music\\Loop.MP3"), "Loop.MP3");
    EXPECT_EQ(QStringList({ExtensionPart("/music/a.b.MP3"), ExtensionPart("/music.d/Loop")}),
              QStringList({".MP3", ""}));
    EXPECT_EQ(FolderPart("Loop.mp3"), "");
    EXPECT_EQ(FileNamePart("Loop.mp3"), "Loop.mp3");
    const QString path = "/home/zoë/Musik/Glockenspiel ♪.wav";
    EXPECT_EQ(FolderPart(path), "/home/zoë/Musik/");
    EXPECT_EQ(FolderPart(path) + FileNamePart(path), path);
    QStringList times;
    for (int ms : {62345, 59999, 600000, -5}) times << TimeText(ms);
    EXPECT_EQ(times, QStringList({"1:02.345", "0:59.999", "10:00.000", "0:00.000"}));
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
