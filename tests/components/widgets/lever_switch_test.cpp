#include "components/widgets/lever_switch.h"
#include "widget_events.h"

#include <QAccessible>
#include <QSignalSpy>
#include <QTest>

#include <gtest/gtest.h>

namespace {

const QStringList kPlayModeTips = {
    "Play Wave Sound Once - Can retrigger", "Play Wave Sound Once - No retrigger",
    "Play Wave Sound Looped - Hold to play", "Play Wave Sound Looped - Toggle On/Off"};

}  // namespace

TEST(LeverSwitchTest, PositionsAreClampedAndEachChangeSignalledOnce) {
    EXPECT_EQ(LeverSwitch(7).positions(), 4);
    EXPECT_EQ(LeverSwitch(1).positions(), 2);
    EXPECT_EQ(LeverSwitch().positions(), 2);

    LeverSwitch lever(3);
    QSignalSpy changed(&lever, &LeverSwitch::positionChanged);
    lever.setPosition(0);
    lever.setPosition(9);
    lever.setPosition(2);
    lever.setPosition(-1);
    EXPECT_EQ(Emitted(changed), QList<int>({2, 0}));
}

TEST(LeverSwitchTest, MouseKeysAndWheelMoveTheLever) {
    LeverSwitch lever(4);
    lever.resize(lever.sizeHint());
    QSignalSpy changed(&lever, &LeverSwitch::positionChanged);

    QTest::mouseClick(&lever, Qt::LeftButton, {}, lever.positionCentre(2).toPoint());
    EXPECT_EQ(lever.position(), 2);
    QTest::mouseClick(&lever, Qt::LeftButton, {}, QPoint(lever.width() / 2, lever.height() - 1));
    EXPECT_EQ(lever.position(), 3) << "the bottom edge is nearest the last position";
    // Dragged from the bottom to above the top, the lever passes every position on the way.
    QTest::mousePress(&lever, Qt::LeftButton, {}, lever.positionCentre(3).toPoint());
    for (int position : {2, 1, 0})
        QTest::mouseMove(&lever, lever.positionCentre(position).toPoint());
    QTest::mouseMove(&lever, QPoint(lever.width() / 2, -40));
    QTest::mouseRelease(&lever, Qt::LeftButton, {}, QPoint(lever.width() / 2, -40));
    EXPECT_EQ(Emitted(changed), QList<int>({2, 3, 2, 1, 0}));
    QTest::mouseClick(&lever, Qt::RightButton, {}, lever.positionCentre(3).toPoint());
    EXPECT_EQ(lever.position(), 0) << "only the left button moves it";

    const auto pressAll = [&](std::initializer_list<int> keys) {
        for (int key : keys) EXPECT_TRUE(PressKey(lever, key)) << key;
        return lever.position();
    };
    EXPECT_EQ(pressAll({Qt::Key_Down}), 1);
    EXPECT_EQ(pressAll({Qt::Key_Down, Qt::Key_Down, Qt::Key_Down}), 3);
    EXPECT_EQ(pressAll({Qt::Key_Up}), 2);
    EXPECT_EQ(pressAll({Qt::Key_Home}), 0);
    EXPECT_EQ(pressAll({Qt::Key_End}), 3);
    EXPECT_EQ(pressAll({Qt::Key_PageUp}), 0);
    EXPECT_EQ(pressAll({Qt::Key_PageDown}), 3);
    EXPECT_FALSE(PressKey(lever, Qt::Key_Q)) << "note keys pass on to the window";

    TurnWheel(lever, 120);
    EXPECT_EQ(lever.position(), 2) << "away from the user is up";
    TurnWheel(lever, -240);
    EXPECT_EQ(lever.position(), 3);
}

TEST(LeverSwitchTest, ToolTipFollowsThePosition) {
    LeverSwitch lever(4);
    lever.setToolTip("set by the window");
    lever.setPosition(1);
    EXPECT_EQ(lever.toolTip(), "set by the window") << "without position tips it is left alone";

    lever.setPositionToolTips(kPlayModeTips);
    EXPECT_EQ(lever.toolTip(), "Play Wave Sound Once - No retrigger");
    lever.blockSignals(true);  // how the window refreshes its controls from the table
    lever.setPosition(2);
    lever.blockSignals(false);
    EXPECT_EQ(lever.toolTip(), "Play Wave Sound Looped - Hold to play");
    PressKey(lever, Qt::Key_Down);
    EXPECT_EQ(lever.toolTip(), "Play Wave Sound Looped - Toggle On/Off");

    QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(&lever);
    ASSERT_NE(accessible, nullptr);
    EXPECT_FALSE(accessible->text(QAccessible::Name).isEmpty());
    EXPECT_EQ(accessible->text(QAccessible::Value), "Play Wave Sound Looped - Toggle On/Off");
    ASSERT_NE(accessible->valueInterface(), nullptr);
    EXPECT_EQ(accessible->valueInterface()->maximumValue().toInt(), 3);
    accessible->valueInterface()->setCurrentValue(0);
    EXPECT_EQ(lever.toolTip(), "Play Wave Sound Once - Can retrigger");
}
