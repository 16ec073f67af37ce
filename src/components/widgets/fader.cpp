#include "components/widgets/fader.h"

#include "components/widgets/control_painting.h"

#include <QMouseEvent>
#include <QPainter>

#include <algorithm>

namespace {
constexpr int kMinimumWidth = 24;
constexpr int kTicks = 11;
}  // namespace

Fader::Fader(QWidget* parent) : ValueControl(parent) {
    setAccessibleName(QStringLiteral("Fader"));
}

QSize Fader::sizeHint() const {
    const double unit = FontUnit(*this);
    return {std::max(kMinimumWidth, qRound(1.5 * unit)), qRound(8 * unit)};
}

QSize Fader::minimumSizeHint() const {
    return {kMinimumWidth, qRound(3 * FontUnit(*this))};
}

double Fader::CapHeight() const {
    return std::max(8.0, 0.9 * FontUnit(*this));
}

double Fader::Travel() const {
    return std::max(0.0, height() - CapHeight() - 2.0);
}

double Fader::CentreYAt(double fraction) const {
    return 1.0 + CapHeight() / 2 + (1 - fraction) * Travel();
}

QRectF Fader::capRect() const {
    const double capWidth = std::min<double>(width() - 2, 1.6 * FontUnit(*this));
    const double centreY = CentreYAt(fraction());
    return {(width() - capWidth) / 2, centreY - CapHeight() / 2, capWidth, CapHeight()};
}

void Fader::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    BeginPaint(painter, rect());

    const double unit = FontUnit(*this);
    const double centreX = width() / 2.0;
    const double top = CentreYAt(1);
    const double bottom = CentreYAt(0);

    QColor tick = palette().color(QPalette::WindowText);
    tick.setAlphaF(0.45);
    painter.setPen(QPen(tick, 1));
    const double tickFrom = 0.3 * unit;
    const double tickTo = std::min(0.75 * unit, width() / 2.0 - 1);
    for (int i = 0; i < kTicks; ++i) {
        const double y = top + (bottom - top) * i / (kTicks - 1);
        DrawTickPair(painter, centreX, y, tickFrom, tickTo);
    }

    const double grooveWidth = std::max(3.0, 0.25 * unit);
    const QRectF groove(centreX - grooveWidth / 2, top, grooveWidth, bottom - top);
    painter.setPen(Qt::NoPen);
    painter.setBrush(palette().color(QPalette::Window).darker(200));
    painter.drawRoundedRect(groove, grooveWidth / 2, grooveWidth / 2);
    const QRectF cap = capRect();
    painter.setBrush(ValueColour());
    painter.drawRoundedRect(
        QRectF(groove.left(), cap.center().y(), grooveWidth, bottom - cap.center().y()),
        grooveWidth / 2, grooveWidth / 2);

    painter.setPen(QPen(palette().color(QPalette::Shadow), 1));
    painter.setBrush(CapGradient(cap, palette().color(QPalette::Button)));
    painter.drawRoundedRect(cap, 2, 2);
    painter.setPen(QPen(palette().color(QPalette::WindowText), std::max(1.0, 0.1 * unit)));
    painter.drawLine(QPointF(cap.left() + 2, cap.center().y()),
                     QPointF(cap.right() - 2, cap.center().y()));
}

void Fader::mousePressEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton) return;
    const QRectF cap = capRect();
    const double y = event->position().y();
    if (cap.top() <= y && y <= cap.bottom()) {
        dragging_ = true;
        grabOffset_ = y - cap.center().y();
        return;
    }
    // Beside the cap: a page step towards the press, so a stray click never jumps far.
    stepBy(y < cap.top() ? pageStep() : -pageStep());
}

void Fader::mouseMoveEvent(QMouseEvent* event) {
    if (!dragging_ || Travel() <= 0) return;
    const double centreY = event->position().y() - grabOffset_;
    setValue(valueAtFraction(1 - (centreY - CentreYAt(1)) / Travel()));
}

void Fader::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) dragging_ = false;
}
