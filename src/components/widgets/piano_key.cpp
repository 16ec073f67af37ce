#include "components/widgets/piano_key.h"

#include "components/widgets/control_painting.h"

#include <QMouseEvent>
#include <QPainter>
#include <QPainterPath>

#include <algorithm>

namespace {

constexpr int kMinimumWidth = 40;  // a key a musician hits at 100 %

struct KeyColours {
    QColor top, bottom, text;
};

KeyColours ColoursOf(bool sharp, bool pressed) {
    static const KeyColours kIvory{QColor::fromRgb(0xf6f5f0), QColor::fromRgb(0xdcdad2),
                                   QColor::fromRgb(0x202020)};
    static const KeyColours kIvoryHeld{QColor::fromRgb(0xb4b2aa), QColor::fromRgb(0xcccac2),
                                       QColor::fromRgb(0x202020)};
    static const KeyColours kEbony{QColor::fromRgb(0x3c3c41), QColor::fromRgb(0x161619),
                                   QColor::fromRgb(0xe6e6ea)};
    static const KeyColours kEbonyHeld{QColor::fromRgb(0x202023), QColor::fromRgb(0x0b0b0d),
                                       QColor::fromRgb(0xb8b8bc)};
    if (sharp) return pressed ? kEbonyHeld : kEbony;
    return pressed ? kIvoryHeld : kIvory;
}

}  // namespace

PianoKey::PianoKey(int note, QWidget* parent) : QWidget(parent), note_(note) {
    setMouseTracking(true);
    // Computer keys play the pads whatever has the focus; a key of this keyboard never takes it.
    setFocusPolicy(Qt::NoFocus);
    setAttribute(Qt::WA_OpaquePaintEvent);
    setAccessibleName(QStringLiteral("Note %1").arg(note));
}

bool PianoKey::IsSharp(int note) {
    const int pitchClass = ((note % 12) + 12) % 12;
    return pitchClass == 1 || pitchClass == 3 || pitchClass == 6 || pitchClass == 8 ||
           pitchClass == 10;
}

void PianoKey::setLabel(const QString& label) {
    label_ = label;
    setAccessibleName(label);
    update();
}

void PianoKey::setPressed(bool pressed) {
    if (pressed == pressed_) return;
    pressed_ = pressed;
    update();
}

void PianoKey::setMarked(bool marked) {
    if (marked == marked_) return;
    marked_ = marked;
    update();
}

void PianoKey::setMarkerColor(const QColor& colour) {
    markerColour_ = colour;
    update();
}

QSize PianoKey::sizeHint() const {
    const double unit = FontUnit(*this);
    return {std::max(kMinimumWidth, qRound(2.6 * unit)), qRound(6 * unit)};
}

QSize PianoKey::minimumSizeHint() const {
    return {kMinimumWidth, qRound(3 * FontUnit(*this))};
}

void PianoKey::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    const double unit = FontUnit(*this);
    const double gap = std::max(1.0, 0.08 * unit);    // between neighbouring keys
    const double depth = std::max(2.0, 0.25 * unit);  // how far a held key sinks
    const double radius = std::min(0.35 * unit, width() / 4.0);
    // Half-pixel insets keep the outline inside the widget.
    const QRectF raised(gap, 0.5, width() - 2 * gap, height() - depth - 1);
    const QRectF body = pressed_ ? raised.translated(0, depth) : raised;

    const auto keyShape = [radius](const QRectF& rect) {
        QPainterPath path;
        path.addRoundedRect(rect, radius, radius);
        QPainterPath squareTop;
        squareTop.addRect(rect.adjusted(0, 0, 0, -rect.height() / 2));
        return path.united(squareTop);
    };
    // The dark key bed shows between the keys and above a held one.
    painter.fillRect(rect(), QColor(0x0e, 0x0e, 0x10));
    const KeyColours colours = ColoursOf(IsSharp(note_), pressed_);
    if (!pressed_) {
        // The front edge of a raised key, which a held key sinks over.
        painter.fillPath(keyShape(raised.translated(0, depth)), colours.bottom.darker(220));
    }
    QLinearGradient face(body.topLeft(), body.bottomLeft());
    face.setColorAt(0, colours.top);
    face.setColorAt(1, colours.bottom);
    painter.setPen(QPen(QColor(0, 0, 0, 200), 1));
    painter.setBrush(face);
    painter.drawPath(keyShape(body));

    if (marked_) PaintMarker(painter, body);
    if (!label_.isEmpty()) {
        painter.setPen(colours.text);
        const QRectF labelArea = body.adjusted(0, 0, 0, -0.3 * unit);
        painter.drawText(labelArea, Qt::AlignHCenter | Qt::AlignBottom, label_);
    }
}

void PianoKey::PaintMarker(QPainter& painter, const QRectF& body) const {
    const double size = std::min(0.8 * FontUnit(*this), body.width() / 2);
    const QPointF tip(body.center().x(), body.top() + body.height() * 0.55);
    const QPointF points[] = {tip, tip + QPointF(size / 2, size * 0.85),
                              tip + QPointF(-size / 2, size * 0.85)};
    painter.setPen(QPen(QColor(0, 0, 0, 220), 1));
    painter.setBrush(markerColour_.isValid() ? markerColour_
                                             : palette().color(QPalette::Highlight));
    painter.drawPolygon(points, 3);
}

void PianoKey::mousePressEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton || mouseHolds_) return;
    mouseHolds_ = true;
    setPressed(true);
    emit pressed(note_);
}

void PianoKey::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton || !mouseHolds_) return;
    mouseHolds_ = false;
    setPressed(false);
    emit released(note_);
    // The mouse stays grabbed by the key it pressed; a release elsewhere is no click.
    if (rect().contains(event->position().toPoint())) emit clicked(note_);
}

void PianoKey::hideEvent(QHideEvent*) {
    // Hidden while the mouse holds it, the key never sees the release: end the note here, or it
    // would sound on.
    endMouseHold();
}

void PianoKey::endMouseHold() {
    if (!mouseHolds_) return;
    mouseHolds_ = false;
    setPressed(false);
    emit released(note_);
}

void PianoKey::mouseMoveEvent(QMouseEvent* event) {
    if (rect().contains(event->position().toPoint())) emit hovered(note_);
}
