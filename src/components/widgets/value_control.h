#pragma once

#include "components/widgets/accessible_value.h"
#include "components/widgets/hand_drawn_control.h"
#include "components/widgets/wheel_steps.h"

#include <functional>

// The part the knob and the fader share: an integer value in a range, moved by keys, the wheel
// and a double click back to its default, with a text for the tool tip and assistive technology.
// Up and Right raise the value, Down and Left lower it, Page Up and Page Down move a large step,
// Home and End go to the minimum and the maximum; other keys pass on to the window.
// valueChanged is emitted for every real change, whether the user or the program made it.
class ValueControl : public HandDrawnControl, public AccessibleValueSource {
    Q_OBJECT
    Q_PROPERTY(int value READ value WRITE setValue NOTIFY valueChanged USER true)
  public:
    // A maximum below the minimum is raised to it. The value is clamped into the new range.
    void setRange(int minimum, int maximum);
    void setMinimum(int minimum);
    void setMaximum(int maximum);
    int minimum() const { return minimum_; }
    int maximum() const { return maximum_; }

    int value() const { return value_; }
    // Clamped into the range; emits valueChanged only when the value changes.
    void setValue(int value);

    // Where a double click puts the value (clamped into the range then); 0 at first.
    void setDefaultValue(int value) { defaultValue_ = value; }
    int defaultValue() const { return defaultValue_; }

    // Steps of the arrow keys and wheel, and of Page Up and Page Down. Until set they follow
    // the range: a hundredth and a tenth of it.
    void setSingleStep(int step) { singleStep_ = step; }
    void setPageStep(int step) { pageStep_ = step; }
    int singleStep() const;
    int pageStep() const;

    // The text of a value for the tool tip and assistive technology; the plain number until set.
    void setValueText(std::function<QString(int)> text);
    QString valueText() const;

  signals:
    void valueChanged(int value);

  protected:
    explicit ValueControl(QWidget* parent);

    // Where the value lies in the range: 0 at the minimum, 1 at the maximum.
    double fraction() const;
    double fractionOf(int value) const;
    int valueAtFraction(double fraction) const;
    // Moves the value by an amount, stopping at the ends.
    void stepBy(qint64 amount);

    void keyPressEvent(QKeyEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;

  private:
    int accessibleValue() const override { return value_; }
    void setAccessibleValue(int value) override { setValue(value); }
    int accessibleMinimum() const override { return minimum_; }
    int accessibleMaximum() const override { return maximum_; }
    int accessibleStep() const override { return singleStep(); }
    QString accessibleValueText() const override { return valueText(); }

    void ShowValue();

    int minimum_ = 0;
    int maximum_ = 100;
    int value_ = 0;
    int defaultValue_ = 0;
    int singleStep_ = 0;  // 0: follow the range
    int pageStep_ = 0;
    std::function<QString(int)> text_;
    WheelSteps wheel_;
};
