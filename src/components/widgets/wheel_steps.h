#pragma once

class QWheelEvent;

// Turns wheel movement into whole notches. High-resolution wheels and touchpads report fractions
// of a notch; the remainder is kept for the next event, so slow scrolling still moves a control.
class WheelSteps {
  public:
    // Notches away from the user (upwards) are positive.
    int take(const QWheelEvent& event);

  private:
    int remainder_ = 0;  // in eighths of a degree, as Qt reports them
};
