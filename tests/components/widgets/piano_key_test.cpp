#include "components/widgets/piano_key.h"

#include <QSignalSpy>
#include <QTest>

#include <gtest/gtest.h>

namespace {

// The note each emission of a signal carried, in order.
QList<int> Emitted(const QSignalSpy& spy) {
    QList<int> notes;
    for (const auto& arguments : spy) notes << arguments.at(0).toInt();
    return notes;
}

}  // namespace

TEST(PianoKeyTest, MousePlaysHoversClicksAndEndsANoteHeldWhileHidden) {
    PianoKey key(60);
    key.resize(key.sizeHint());
    EXPECT_EQ(key.focusPolicy(), Qt::NoFocus) << "computer keys must reach the pads";
    QSignalSpy pressed(&key, &PianoKey::pressed), released(&key, &PianoKey::released),
        hovered(&key, &PianoKey::hovered), clicked(&key, &PianoKey::clicked);
    const QPoint inside = key.rect().center();
    const QPoint outside(key.width() + 30, inside.y());

    key.show();  // hovering needs a window under the mouse
    QTest::mouseMove(&key, inside);
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);  // a repeated report of the same press
    EXPECT_TRUE(key.isPressed()) << "a key held with the mouse sinks";
    QTest::mouseRelease(&key, Qt::LeftButton, {}, inside);
    // Dragged off the key before letting go: the note stops, but that is no click.
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);
    QTest::mouseMove(&key, outside);
    QTest::mouseRelease(&key, Qt::LeftButton, {}, outside);
    // Hidden while held (the window closes mid-note), the key ends the note itself, once.
    QTest::mousePress(&key, Qt::LeftButton, {}, inside);
    key.hide();
    EXPECT_FALSE(key.isPressed());
    QTest::mouseRelease(&key, Qt::LeftButton, {}, inside);
    // Neither the right button nor the program plays a note.
    QTest::mouseClick(&key, Qt::RightButton, {}, inside);
    key.setPressed(true);

    EXPECT_EQ(Emitted(hovered), QList<int>({60})) << "moving outside the key is no hover";
    EXPECT_EQ(Emitted(clicked), QList<int>({60}));
    EXPECT_EQ(pressed.count(), 3);
    EXPECT_EQ(released.count(), 3);
}
