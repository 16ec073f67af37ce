#include "components/widgets/piano_key.h"
#include "widget_events.h"

#include <QSignalSpy>
#include <QTest>

#include <gtest/gtest.h>

namespace {

struct KeySignals {
    explicit KeySignals(PianoKey& key)
        : pressed(&key, &PianoKey::pressed),
          released(&key, &PianoKey::released),
          hovered(&key, &PianoKey::hovered),
          clicked(&key, &PianoKey::clicked) {}
    QSignalSpy pressed, released, hovered, clicked;
};

// The mean brightness (0..255) of a rectangle of the image.
double MeanValue(const QImage& image, const QRect& area) {
    double sum = 0;
    for (int y = area.top(); y <= area.bottom(); ++y) {
        for (int x = area.left(); x <= area.right(); ++x) sum += image.pixelColor(x, y).value();
    }
    return sum / (area.width() * area.height());
}

}  // namespace

TEST(PianoKeyTest, MousePlaysHoversAndClicks) {
    PianoKey key(60);
    key.resize(key.sizeHint());
    EXPECT_TRUE(key.hasMouseTracking());
    EXPECT_EQ(key.focusPolicy(), Qt::NoFocus) << "computer keys must reach the pads";
    KeySignals signal(key);
    const QPoint inside = key.rect().center();

    key.show();  // hovering needs a window under the mouse
    QTest::mouseMove(&key, inside);
    ASSERT_EQ(signal.hovered.count(), 1);
    EXPECT_EQ(signal.hovered.at(0).at(0).toInt(), 60);

    QTest::mousePress(&key, Qt::LeftButton, {}, inside);
    EXPECT_TRUE(key.isPressed()) << "a key held with the mouse sinks";
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);  // a repeated report of the same press
    QTest::mouseRelease(&key, Qt::LeftButton, {}, inside);
    EXPECT_FALSE(key.isPressed());
    EXPECT_EQ(signal.pressed.count(), 1);
    EXPECT_EQ(signal.released.count(), 1);
    ASSERT_EQ(signal.clicked.count(), 1);
    EXPECT_EQ(signal.clicked.at(0).at(0).toInt(), 60);

    // Dragged off the key before letting go: the note stops, but that is no click.
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);
    QTest::mouseMove(&key, QPoint(key.width() + 30, inside.y()));
    QTest::mouseRelease(&key, Qt::LeftButton, {}, QPoint(key.width() + 30, inside.y()));
    EXPECT_EQ(signal.released.count(), 2);
    EXPECT_EQ(signal.clicked.count(), 1);
    EXPECT_EQ(signal.hovered.count(), 1) << "moving outside the key is no hover";

    // Hidden while held (the window closes mid-note), the key ends the note itself.
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);
    key.hide();
    EXPECT_EQ(signal.released.count(), 3);
    EXPECT_FALSE(key.isPressed());
    QTest::mouseRelease(&key, Qt::LeftButton, {}, inside);
    EXPECT_EQ(signal.released.count(), 3) << "and only once";

    QTest::mouseClick(&key, Qt::RightButton, {}, inside);
    key.setPressed(true);
    key.setMarked(true);
    EXPECT_EQ(signal.pressed.count(), 3) << "the right button and the program play nothing";
    EXPECT_EQ(signal.released.count(), 3);
    EXPECT_TRUE(key.isPressed());
}

TEST(PianoKeyTest, SharpsAreDarkerAndHeldKeysSink) {
    for (int note = 57; note <= 72; ++note) {
        PianoKey key(note);
        key.resize(key.sizeHint());
        const QImage image = Render(key);
        const QRect middle(key.width() / 4, key.height() / 4, key.width() / 2, key.height() / 4);
        const bool sharp = QList<int>({1, 3, 6, 8, 10}).contains(note % 12);
        EXPECT_EQ(PianoKey::IsSharp(note), sharp) << note;
        if (sharp) {
            EXPECT_LT(MeanValue(image, middle), 90) << note;
        } else {
            EXPECT_GT(MeanValue(image, middle), 180) << note;
        }
    }

    // A raised key's face starts at the top edge and shows its darker front edge at the bottom;
    // a held one has moved down over that edge, leaving the key bed visible above it.
    PianoKey key(60);
    key.resize(key.sizeHint());
    const QRect topRow(key.width() / 4, 1, key.width() / 2, 1);
    const QRect bottomRow(key.width() / 4, key.height() - 2, key.width() / 2, 1);
    const QImage raised = Render(key);
    key.setPressed(true);
    const QImage held = Render(key);
    EXPECT_GT(MeanValue(raised, topRow), 200);
    EXPECT_LT(MeanValue(held, topRow), 40);
    EXPECT_LT(MeanValue(raised, bottomRow), MeanValue(held, bottomRow) - 40);
}

TEST(PianoKeyTest, MarkerSitsALittleBelowTheMiddle) {
    const QColor marker(255, 0, 255);
    PianoKey key(61);
    key.resize(key.sizeHint());
    key.setMarkerColor(marker);
    key.setLabel("C#4");
    const auto markerRows = [&] {
        const QImage image = Render(key);
        QList<int> rows;
        for (int y = 0; y < image.height(); ++y) {
            for (int x = 0; x < image.width(); ++x) {
                if (image.pixelColor(x, y) == marker) {
                    rows << y;
                    break;
                }
            }
        }
        return rows;
    };
    EXPECT_TRUE(markerRows().isEmpty());
    key.setMarked(true);
    const QList<int> rows = markerRows();
    ASSERT_FALSE(rows.isEmpty());
    EXPECT_GT(rows.first(), key.height() / 2);
    EXPECT_LT(rows.last(), key.height() * 3 / 4);
}
