#include "components/widgets/wheel_steps.h"

#include <QWheelEvent>

namespace {
constexpr int kNotch = 120;  // eighths of a degree in one notch of a standard wheel
}

int WheelSteps::take(const QWheelEvent& event) {
    const QPoint delta = event.angleDelta();
    // A sideways wheel (or a touchpad moved sideways) counts too; right is "up".
    int amount = delta.y() != 0 ? delta.y() : delta.x();
    if (event.inverted()) amount = -amount;
    remainder_ += amount;
    const int steps = remainder_ / kNotch;
    remainder_ -= steps * kNotch;
    return steps;
}
