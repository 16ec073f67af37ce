#include "components/widgets/hand_drawn_control.h"

#include "components/widgets/accessible_value.h"
#include "components/widgets/control_painting.h"

#include <QPainter>

HandDrawnControl::HandDrawnControl(QWidget* parent) : QWidget(parent) {
    InstallValueAccessibility();
    setFocusPolicy(Qt::StrongFocus);
}

void HandDrawnControl::setAccentColor(const QColor& colour) {
    accent_ = colour;
    update();
}

QColor HandDrawnControl::accentColor() const {
    return accent_.isValid() ? accent_ : palette().color(QPalette::Highlight);
}

void HandDrawnControl::BeginPaint(QPainter& painter, const QRectF& focusArea) const {
    painter.setRenderHint(QPainter::Antialiasing);
    if (hasFocus()) DrawFocusFrame(painter, focusArea, palette());
}

QColor HandDrawnControl::ValueColour() const {
    if (isEnabled()) return accentColor();
    return palette().color(QPalette::Disabled, QPalette::WindowText);
}
