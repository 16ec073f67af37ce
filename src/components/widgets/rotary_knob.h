#pragma once

#include "components/widgets/value_control.h"

// A rotary knob: a round cap with a pointer inside an arc that lights from the zero point (or
// from the minimum when the range does not include zero) to the value, swept over 270 degrees
// from lower left (minimum) to lower right (maximum). Dragging up raises the value; a drag of
// about ten lines of text crosses the whole range. A double click returns to the default value.
class RotaryKnob : public ValueControl {
    Q_OBJECT
  public:
    explicit RotaryKnob(QWidget* parent = nullptr);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

  private:
    double DragLength() const;

    bool dragging_ = false;
    double dragStartY_ = 0;
    double dragStartFraction_ = 0;
};
