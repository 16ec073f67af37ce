#pragma once

#include <QColor>
#include <QLinearGradient>
#include <QRectF>

class QPainter;
class QPalette;
class QWidget;

// One unit of control size: the height of a line of the widget's font. Sizes measured in it grow
// with the user's font and with display scaling alike, so no control keeps fixed pixels.
qreal FontUnit(const QWidget& widget);

// The keyboard focus ring of the hand-drawn controls, in the palette's highlight colour.
void DrawFocusFrame(QPainter& painter, const QRectF& rect, const QPalette& palette);

// Light from above on a raised part (knob body, fader cap, lever head) of the given colour.
QLinearGradient CapGradient(const QRectF& rect, const QColor& base);

// A short scale mark on each side of a vertical groove centred at centreX, from `from` to `to`
// away from the centre.
void DrawTickPair(QPainter& painter, double centreX, double y, double from, double to);
