#include "app/pad_strip.h"

#include <QLabel>

#include <gtest/gtest.h>

TEST(PadStripTest, AWavePadShowsItsFileNameElidedWithTheFullPathInTheToolTip) {
    PadStrip strip(60, QStringLiteral("Note 4 C4"));
    strip.show();
    const QString path =
        QStringLiteral("/home/player/sounds/") + QString(60, u'x') + QStringLiteral(" loop.wav");
    strip.ShowWaveFile(path);
    const auto* label = strip.findChild<QLabel*>(QStringLiteral("lblWaveFile60"));
    EXPECT_EQ(label->text(), "");  // a MIDI pad has no file to show

    strip.ShowFunction(true);
    const QString shown = label->text();
    EXPECT_TRUE(shown.startsWith("xx") && shown.contains(u'\u2026') && shown.endsWith(" loop.wav"))
        << shown;
    EXPECT_LE(label->fontMetrics().horizontalAdvance(shown), label->width());
    EXPECT_EQ(label->toolTip(), path);
    strip.ShowWaveFile(QStringLiteral("/sounds/kick.wav"));
    EXPECT_EQ(label->text(), "kick.wav");
}
