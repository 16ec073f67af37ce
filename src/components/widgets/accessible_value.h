#pragma once

#include <QString>

class QWidget;

// What a stepped control (knob, fader, lever) tells assistive technology about its value: the
// number, its limits, and the text a person hears ("Pan: centre").
class AccessibleValueSource {
  public:
    virtual int accessibleValue() const = 0;
    virtual void setAccessibleValue(int value) = 0;
    virtual int accessibleMinimum() const = 0;
    virtual int accessibleMaximum() const = 0;
    virtual int accessibleStep() const = 0;
    virtual QString accessibleValueText() const = 0;

  protected:
    ~AccessibleValueSource() = default;
};

// Registers, once, the accessibility interfaces of the stepped controls.
void InstallValueAccessibility();

// Tells listening assistive technology that the control's value changed.
void NotifyAccessibleValue(QWidget* control, int value);
