#pragma once
// Events QTest has no helper for, sent the way the window system would deliver them.

#include <QApplication>
#include <QImage>
#include <QKeyEvent>
#include <QSignalSpy>
#include <QWheelEvent>
#include <QWidget>

// Turns the wheel by `delta` eighths of a degree (120 = one notch away from the user) over the
// widget's centre.
inline void TurnWheel(QWidget& widget, int delta) {
    const QPointF centre(widget.width() / 2.0, widget.height() / 2.0);
    QWheelEvent event(centre, widget.mapToGlobal(centre), QPoint(), QPoint(0, delta), Qt::NoButton,
                      Qt::NoModifier, Qt::NoScrollPhase, false);
    QApplication::sendEvent(&widget, &event);
}

// Presses a key on the widget; true when the widget kept it rather than passing it on.
inline bool PressKey(QWidget& widget, int key) {
    QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
    QApplication::sendEvent(&widget, &event);
    return event.isAccepted();
}

// The int each emission of a one-argument signal carried, in order.
inline QList<int> Emitted(const QSignalSpy& spy) {
    QList<int> values;
    for (const auto& arguments : spy) values << arguments.at(0).toInt();
    return values;
}

// The widget as drawn at the given device pixel ratio, at its current size.
inline QImage Render(QWidget& widget, qreal ratio = 1) {
    QImage image(widget.size() * ratio, QImage::Format_ARGB32_Premultiplied);
    image.setDevicePixelRatio(ratio);
    image.fill(widget.palette().color(QPalette::Window));
    widget.render(&image, QPoint(), QRegion(), QWidget::DrawChildren);
    return image;
}
