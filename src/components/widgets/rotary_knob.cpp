#include "components/widgets/rotary_knob.h"

#include "components/widgets/control_painting.h"

#include <QMouseEvent>
#include <QPainter>
#include <QtMath>

#include <algorithm>

namespace {

constexpr double kStartDegrees = 225;  // the minimum, at lower left (Qt counts anticlockwise)
constexpr double kSweepDegrees = 270;
constexpr int kMinimumSide = 24;  // a target a finger or a mouse hits at 100 %

double AngleAt(double fraction) {
    return kStartDegrees - kSweepDegrees * fraction;
}

}  // namespace

RotaryKnob::RotaryKnob(QWidget* parent) : ValueControl(parent) {
    setAccessibleName(QStringLiteral("Knob"));
    setCursor(Qt::SizeVerCursor);
}

QSize RotaryKnob::sizeHint() const {
    const int side = std::max(kMinimumSide, qRound(2.4 * FontUnit(*this)));
    return {side, side};
}

QSize RotaryKnob::minimumSizeHint() const {
    return {kMinimumSide, kMinimumSide};
}

double RotaryKnob::DragLength() const {
    return 10 * FontUnit(*this);
}

void RotaryKnob::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    const double side = std::min(width(), height());
    const QRectF square((width() - side) / 2, (height() - side) / 2, side, side);
    BeginPaint(painter, square);

    const double ringWidth = std::max(2.0, side * 0.12);
    const QRectF ring = square.adjusted(ringWidth, ringWidth, -ringWidth, -ringWidth);
    const auto arc = [&](double from, double to, const QColor& colour) {
        painter.setPen(QPen(colour, ringWidth, Qt::SolidLine, Qt::FlatCap));
        const double start = AngleAt(from);
        painter.drawArc(ring, qRound(start * 16), qRound((AngleAt(to) - start) * 16));
    };
    arc(0, 1, palette().color(QPalette::Window).darker(170));
    // A range around zero (pan) lights from the centre, others from the minimum.
    const double origin = minimum() < 0 && maximum() > 0 ? fractionOf(0) : 0;
    arc(origin, fraction(), ValueColour());

    const QRectF body = ring.adjusted(ringWidth, ringWidth, -ringWidth, -ringWidth);
    painter.setPen(QPen(palette().color(QPalette::Shadow), 1));
    painter.setBrush(CapGradient(body, palette().color(QPalette::Button)));
    painter.drawEllipse(body);

    const double angle = qDegreesToRadians(AngleAt(fraction()));
    const QPointF direction(std::cos(angle), -std::sin(angle));
    const double radius = body.width() / 2;
    painter.setPen(QPen(palette().color(QPalette::WindowText), std::max(1.5, side * 0.06),
                        Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(body.center() + direction * radius * 0.25,
                     body.center() + direction * radius * 0.8);
}

void RotaryKnob::mousePressEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton) return;
    dragging_ = true;
    dragStartY_ = event->position().y();
    dragStartFraction_ = fraction();
}

void RotaryKnob::mouseMoveEvent(QMouseEvent* event) {
    if (!dragging_) return;
    const double y = event->position().y();
    const double wanted = dragStartFraction_ + (dragStartY_ - y) / DragLength();
    setValue(valueAtFraction(wanted));
    // Past an end the knob starts back at once when the drag turns round.
    if (wanted < 0 || wanted > 1) {
        dragStartY_ = y;
        dragStartFraction_ = std::clamp(wanted, 0.0, 1.0);
    }
}

void RotaryKnob::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) dragging_ = false;
}
