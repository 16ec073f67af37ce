#pragma once

#include <QColor>
#include <QWidget>

// One key of the on-screen keyboard, drawn like a piano key: ivory for the natural notes, ebony
// for the sharps (pitch classes 1, 3, 6, 8 and 10), square at the top and rounded at the bottom,
// with its label near the bottom edge, on a dark key bed. A raised key shows its front edge
// below it; a held key sinks over that edge and darkens. The note marker, a small triangle a little
// below the middle, shows the key that the note picker edits. Only the left button plays. The key
// sinks by itself while the mouse holds it, and rises again when the mouse lets go; setPressed
// shows notes held by other means (computer keys, MIDI input).
class PianoKey : public QWidget {
    Q_OBJECT
  public:
    explicit PianoKey(int note, QWidget* parent = nullptr);

    int note() const { return note_; }
    static bool IsSharp(int note);

    void setLabel(const QString& label);
    QString label() const { return label_; }

    // Only changes what is shown; no signal.
    void setPressed(bool pressed);
    bool isPressed() const { return pressed_; }

    void setMarked(bool marked);
    bool isMarked() const { return marked_; }

    // Ends a press of the mouse whose release this key will not see (the window was blocked by
    // a modal window or lost the focus): the key comes up and reports the release. No click.
    void endMouseHold();
    // The marker's colour; the palette's highlight until set.
    void setMarkerColor(const QColor& colour);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  signals:
    void pressed(int note);
    void released(int note);
    void hovered(int note);
    // A press and a release on this key.
    void clicked(int note);

  protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void hideEvent(QHideEvent* event) override;

  private:
    void PaintMarker(QPainter& painter, const QRectF& body) const;

    int note_;
    QString label_;
    bool pressed_ = false;
    bool marked_ = false;
    bool mouseHolds_ = false;
    QColor markerColour_;
};
