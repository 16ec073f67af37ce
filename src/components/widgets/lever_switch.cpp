#include "components/widgets/lever_switch.h"

#include "components/widgets/control_painting.h"

#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>

#include <algorithm>
#include <cmath>

namespace {
constexpr int kMinimumWidth = 24;
constexpr double kSpacingUnits = 1.1;  // between positions, in lines of text
}  // namespace

LeverSwitch::LeverSwitch(int positions, QWidget* parent)
    : HandDrawnControl(parent), positions_(std::clamp(positions, 2, 4)) {
    setAccessibleName(QStringLiteral("Lever switch"));
}

void LeverSwitch::setPosition(int position) {
    position = std::clamp(position, 0, positions_ - 1);
    if (position == position_) return;
    position_ = position;
    ShowPosition();
    NotifyAccessibleValue(this, position_);
    emit positionChanged(position_);
}

void LeverSwitch::setPositionToolTips(const QStringList& tips) {
    tips_ = tips;
    ShowPosition();
}

QString LeverSwitch::valueText() const {
    const QString tip = tips_.value(position_);
    return tip.isEmpty() ? QString::number(position_) : tip;
}

void LeverSwitch::ShowPosition() {
    if (!tips_.isEmpty()) setToolTip(tips_.value(position_));
    update();
}

double LeverSwitch::HeadHeight() const {
    return std::max(8.0, 0.8 * FontUnit(*this));
}

double LeverSwitch::Spacing() const {
    // The positions share the height left once the head fits at both ends.
    return std::max(1.0, (height() - HeadHeight() - 2.0) / (positions_ - 1));
}

QPointF LeverSwitch::positionCentre(int position) const {
    return {width() / 2.0, 1.0 + HeadHeight() / 2 + position * Spacing()};
}

int LeverSwitch::NearestPosition(double y) const {
    const double steps = (y - positionCentre(0).y()) / Spacing();
    return std::clamp(static_cast<int>(std::lround(steps)), 0, positions_ - 1);
}

QSize LeverSwitch::sizeHint() const {
    const double unit = FontUnit(*this);
    const double height = HeadHeight() + 2 + (positions_ - 1) * kSpacingUnits * unit;
    return {std::max(kMinimumWidth, qRound(1.8 * unit)), qRound(height)};
}

QSize LeverSwitch::minimumSizeHint() const {
    const double height = HeadHeight() + 2 + (positions_ - 1) * 0.6 * FontUnit(*this);
    return {kMinimumWidth, qRound(height)};
}

void LeverSwitch::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    BeginPaint(painter, rect());

    const double unit = FontUnit(*this);
    const double centreX = width() / 2.0;
    const double slotWidth = std::max(4.0, 0.35 * unit);
    const double first = positionCentre(0).y();
    const double last = positionCentre(positions_ - 1).y();
    const QRectF slot(centreX - slotWidth / 2, first - slotWidth / 2, slotWidth,
                      last - first + slotWidth);
    painter.setPen(QPen(palette().color(QPalette::Shadow), 1));
    painter.setBrush(palette().color(QPalette::Window).darker(220));
    painter.drawRoundedRect(slot, slotWidth / 2, slotWidth / 2);

    const QColor lit = ValueColour();
    QColor unlit = palette().color(QPalette::WindowText);
    unlit.setAlphaF(0.45);
    const double tickFrom = slotWidth / 2 + 0.15 * unit;
    const double tickTo = std::max(tickFrom + 2, std::min(0.85 * unit, centreX - 1));
    for (int i = 0; i < positions_; ++i) {
        const double y = positionCentre(i).y();
        painter.setPen(i == position_ ? QPen(lit, 2) : QPen(unlit, 1));
        DrawTickPair(painter, centreX, y, tickFrom, tickTo);
    }

    const double headWidth = std::min(width() - 4.0, 1.2 * unit);
    const QPointF centre = positionCentre(position_);
    const QRectF head(centre.x() - headWidth / 2, centre.y() - HeadHeight() / 2, headWidth,
                      HeadHeight());
    painter.setPen(QPen(palette().color(QPalette::Shadow), 1));
    painter.setBrush(CapGradient(head, palette().color(QPalette::Button)));
    painter.drawRoundedRect(head, HeadHeight() / 3, HeadHeight() / 3);
    painter.setPen(QPen(lit, std::max(1.5, 0.12 * unit), Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(QPointF(head.left() + 3, centre.y()), QPointF(head.right() - 3, centre.y()));
}

void LeverSwitch::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) setPosition(NearestPosition(event->position().y()));
}

void LeverSwitch::mouseMoveEvent(QMouseEvent* event) {
    if (event->buttons() & Qt::LeftButton) setPosition(NearestPosition(event->position().y()));
}

void LeverSwitch::keyPressEvent(QKeyEvent* event) {
    switch (event->key()) {
        case Qt::Key_Up:
            setPosition(position_ - 1);
            break;
        case Qt::Key_Down:
            setPosition(position_ + 1);
            break;
        case Qt::Key_PageUp:
        case Qt::Key_Home:
            setPosition(0);
            break;
        case Qt::Key_PageDown:
        case Qt::Key_End:
            setPosition(positions_ - 1);
            break;
        default:
            event->ignore();
    }
}

void LeverSwitch::wheelEvent(QWheelEvent* event) {
    // Turning the wheel away from the user pushes the lever up, towards position 0.
    setPosition(position_ - wheel_.take(*event));
}
