#include "components/widgets/fader.h"
#include "components/widgets/rotary_knob.h"
#include "widget_events.h"

#include <QAccessible>
#include <QSignalSpy>
#include <QTest>

#include <gtest/gtest.h>

TEST(RotaryKnobTest, ClampsAndSignalsOnlyRealChanges) {
    RotaryKnob knob;
    knob.setRange(-10000, 10000);
    QSignalSpy changed(&knob, &RotaryKnob::valueChanged);
    knob.setValue(0);
    knob.setValue(12000);
    knob.setValue(10000);
    knob.setRange(-5000, 5000);  // the value no longer fits
    knob.setRange(-6000, 6000);  // it does
    EXPECT_EQ(Emitted(changed), QList<int>({10000, 5000}));

    knob.setRange(100, 50);
    EXPECT_EQ(knob.minimum(), 100);
    EXPECT_EQ(knob.maximum(), 100) << "a maximum below the minimum is raised to it";
    EXPECT_EQ(knob.value(), 100);
}

TEST(RotaryKnobTest, KeysAndWheelStepWithinTheRange) {
    RotaryKnob knob;
    knob.setRange(-10000, 10000);  // steps of 200 and 2000 follow the range
    const auto pressAll = [&](std::initializer_list<int> keys) {
        for (int key : keys) EXPECT_TRUE(PressKey(knob, key)) << key;
        return knob.value();
    };
    EXPECT_EQ(pressAll({Qt::Key_Up, Qt::Key_Right, Qt::Key_Down}), 200);
    EXPECT_EQ(pressAll({Qt::Key_PageUp, Qt::Key_PageDown, Qt::Key_PageDown}), -1800);
    EXPECT_EQ(pressAll({Qt::Key_End, Qt::Key_Up, Qt::Key_PageUp}), 10000);
    EXPECT_EQ(pressAll({Qt::Key_Home, Qt::Key_Left}), -10000);
    EXPECT_FALSE(PressKey(knob, Qt::Key_A)) << "note keys pass on to the window";
    EXPECT_FALSE(PressKey(knob, Qt::Key_Space));

    knob.setValue(0);
    knob.setSingleStep(5);
    TurnWheel(knob, 120);
    EXPECT_EQ(knob.value(), 5);
    TurnWheel(knob, 60);  // half notches of a fine wheel add up
    EXPECT_EQ(knob.value(), 5);
    TurnWheel(knob, 60);
    EXPECT_EQ(knob.value(), 10);
    TurnWheel(knob, -360);
    EXPECT_EQ(knob.value(), -5);
}

TEST(RotaryKnobTest, DragUpRaisesAndDoubleClickReturnsToTheDefault) {
    RotaryKnob knob;
    knob.resize(knob.sizeHint());
    knob.setRange(-10000, 10000);
    knob.setDefaultValue(0);
    const QPoint centre = knob.rect().center();
    const int quarter = knob.fontMetrics().height() * 10 / 4;  // a whole drag is ten lines

    QTest::mousePress(&knob, Qt::LeftButton, {}, centre);
    QTest::mouseMove(&knob, centre - QPoint(0, quarter));
    EXPECT_NEAR(knob.value(), 5000, 500);
    QTest::mouseMove(&knob, centre - QPoint(0, 20 * quarter));
    EXPECT_EQ(knob.value(), 10000);
    QTest::mouseMove(&knob, centre - QPoint(0, 19 * quarter));
    EXPECT_NEAR(knob.value(), 5000, 500) << "turns back at once after overshooting the end";
    QTest::mouseRelease(&knob, Qt::LeftButton, {}, centre - QPoint(0, 19 * quarter));
    QTest::mouseMove(&knob, centre);
    EXPECT_NEAR(knob.value(), 5000, 500) << "no drag after the release";

    QTest::mouseDClick(&knob, Qt::LeftButton, {}, centre);
    EXPECT_EQ(knob.value(), 0);
    knob.setDefaultValue(20000);
    QTest::mouseDClick(&knob, Qt::LeftButton, {}, centre);
    EXPECT_EQ(knob.value(), 10000) << "a default outside the range is clamped";
}

TEST(RotaryKnobTest, ValueTextFeedsToolTipAndAssistiveTechnology) {
    RotaryKnob knob;
    knob.setRange(-10000, 10000);
    knob.setValue(-3500);
    EXPECT_EQ(knob.toolTip(), "-3500");
    knob.setValueText([](int pan) {
        return pan == 0 ? QStringLiteral("Centre") : QStringLiteral("Pan: L %1").arg(-pan / 100);
    });
    EXPECT_EQ(knob.toolTip(), "Pan: L 35");

    QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(&knob);
    ASSERT_NE(accessible, nullptr);
    EXPECT_EQ(accessible->role(), QAccessible::Dial);
    EXPECT_EQ(accessible->text(QAccessible::Value), "Pan: L 35");
    ASSERT_NE(accessible->valueInterface(), nullptr);
    EXPECT_EQ(accessible->valueInterface()->maximumValue().toInt(), 10000);
    accessible->valueInterface()->setCurrentValue(0);
    EXPECT_EQ(knob.value(), 0);
    EXPECT_EQ(knob.toolTip(), "Centre");
}

TEST(FaderTest, CapFollowsTheMouseAboveARaisedFloor) {
    Fader fader;
    fader.resize(fader.sizeHint());
    fader.setRange(-10000, 0);
    fader.setValue(-8000);
    QSignalSpy changed(&fader, &Fader::valueChanged);
    fader.setMinimum(-5000);  // as the window does at start-up
    EXPECT_EQ(fader.value(), -5000);
    EXPECT_GT(fader.capRect().center().y(), fader.height() * 0.8) << "the minimum is at the bottom";

    // Grabbed off centre, the cap keeps that offset and does not jump; it stops at the ends.
    const QPoint grab = fader.capRect().center().toPoint() + QPoint(0, 2);
    QTest::mousePress(&fader, Qt::LeftButton, {}, grab);
    QTest::mouseMove(&fader, QPoint(grab.x(), fader.height() + 50));
    QTest::mouseMove(&fader, QPoint(grab.x(), fader.height() / 2 + 2));
    EXPECT_NEAR(fader.value(), -2500, 150);
    QTest::mouseMove(&fader, QPoint(grab.x(), -100));
    QTest::mouseRelease(&fader, Qt::LeftButton, {}, QPoint(grab.x(), -100));
    EXPECT_EQ(fader.value(), 0);

    // A press beside the cap moves a page step towards it; above the top there is nothing left.
    QTest::mouseClick(&fader, Qt::LeftButton, {}, QPoint(grab.x(), 0));
    QTest::mouseClick(&fader, Qt::LeftButton, {}, QPoint(grab.x(), fader.height() - 2));
    EXPECT_EQ(fader.value(), -500);
    PressKey(fader, Qt::Key_Home);
    TurnWheel(fader, -1200);
    EXPECT_EQ(fader.value(), -5000) << "nothing goes below the floor";
    EXPECT_EQ(Emitted(changed).first(), -5000);
}
