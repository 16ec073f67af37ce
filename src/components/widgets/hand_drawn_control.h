#pragma once

#include <QColor>
#include <QWidget>

class QPainter;

// The base of the hand-drawn controls that take the keyboard focus and show their value in an
// accent colour: the lever switch, the knob and the fader.
class HandDrawnControl : public QWidget {
    Q_OBJECT
  public:
    // The colour of the value (arc, lit groove, lit tick); the palette's highlight until set.
    // The window gives the pads' controls the MIDI or the wave accent.
    void setAccentColor(const QColor& colour);
    QColor accentColor() const;

  protected:
    explicit HandDrawnControl(QWidget* parent);

    // Antialiasing on, and the focus ring drawn when the control has the focus.
    void BeginPaint(QPainter& painter, const QRectF& focusArea) const;
    // The accent while enabled, grey while disabled.
    QColor ValueColour() const;

  private:
    QColor accent_;
};
