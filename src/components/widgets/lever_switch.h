#pragma once

#include "components/widgets/accessible_value.h"
#include "components/widgets/hand_drawn_control.h"
#include "components/widgets/wheel_steps.h"

#include <QStringList>

// A vertical lever switch with 2, 3 or 4 positions. Position 0 is at the top and the last one at
// the bottom, read like a list of options. It is drawn as a slot with a tick at each position and
// a lever head standing at the current one; the tick of the current position is lit.
// A press or drag moves the lever to the position nearest the mouse; Up and Down (and the wheel)
// move it one position, Page Up and Home to the top, Page Down and End to the bottom.
// positionChanged is emitted for every real change, whether the user or the program made it.
class LeverSwitch : public HandDrawnControl, public AccessibleValueSource {
    Q_OBJECT
    Q_PROPERTY(int position READ position WRITE setPosition NOTIFY positionChanged USER true)
  public:
    // Fewer than 2 positions are taken as 2, more than 4 as 4.
    explicit LeverSwitch(int positions = 2, QWidget* parent = nullptr);

    int positions() const { return positions_; }
    int position() const { return position_; }
    // Clamped into 0..positions() - 1; emits positionChanged only when the position changes.
    void setPosition(int position);

    // One tool tip a position; the switch's tool tip follows its position. An empty list leaves
    // the tool tip to the caller.
    void setPositionToolTips(const QStringList& tips);
    QStringList positionToolTips() const { return tips_; }

    // The position's tool tip, or its number where there is none.
    QString valueText() const;

    // The centre of a position's tick, for a press that should land on it.
    QPointF positionCentre(int position) const;

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  signals:
    void positionChanged(int position);

  protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;

  private:
    int accessibleValue() const override { return position_; }
    void setAccessibleValue(int value) override { setPosition(value); }
    int accessibleMinimum() const override { return 0; }
    int accessibleMaximum() const override { return positions_ - 1; }
    int accessibleStep() const override { return 1; }
    QString accessibleValueText() const override { return valueText(); }

    double HeadHeight() const;
    double Spacing() const;
    int NearestPosition(double y) const;
    void ShowPosition();

    int positions_;
    int position_ = 0;
    QStringList tips_;
    WheelSteps wheel_;
};
