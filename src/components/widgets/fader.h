#pragma once

#include "components/widgets/value_control.h"

// A slim vertical fader: a groove with scale ticks on both sides, lit from the bottom up to a
// cap that slides in it; the maximum is at the top. Dragging the cap moves it with the mouse; a
// press beside the cap moves one page step towards the press. A double click returns to the
// default value.
class Fader : public ValueControl {
    Q_OBJECT
  public:
    explicit Fader(QWidget* parent = nullptr);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

    // Where the cap is drawn, for a press that should grab it.
    QRectF capRect() const;

  protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

  private:
    double CapHeight() const;
    double Travel() const;  // how far the cap's centre moves from the minimum to the maximum
    double CentreYAt(double fraction) const;

    bool dragging_ = false;
    double grabOffset_ = 0;  // from the cap's centre to where it was grabbed
};
