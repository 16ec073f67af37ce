#include "components/widgets/control_painting.h"

#include <QPainter>
#include <QPalette>
#include <QPen>
#include <QWidget>

qreal FontUnit(const QWidget& widget) {
    return widget.fontMetrics().height();
}

void DrawFocusFrame(QPainter& painter, const QRectF& rect, const QPalette& palette) {
    painter.save();
    QPen pen(palette.color(QPalette::Highlight), 1.5);
    painter.setPen(pen);
    painter.setBrush(Qt::NoBrush);
    painter.drawRoundedRect(rect.adjusted(0.75, 0.75, -0.75, -0.75), 3, 3);
    painter.restore();
}

QLinearGradient CapGradient(const QRectF& rect, const QColor& base) {
    QLinearGradient gradient(rect.topLeft(), rect.bottomLeft());
    gradient.setColorAt(0, base.lighter(150));
    gradient.setColorAt(0.5, base);
    gradient.setColorAt(1, base.darker(150));
    return gradient;
}

void DrawTickPair(QPainter& painter, double centreX, double y, double from, double to) {
    painter.drawLine(QPointF(centreX - to, y), QPointF(centreX - from, y));
    painter.drawLine(QPointF(centreX + from, y), QPointF(centreX + to, y));
}
