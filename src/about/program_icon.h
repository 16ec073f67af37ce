#pragma once

#include <QIconEngine>

class QPainter;
class QRectF;

// The program's picture: sixteen pads in four rows, some lit in the MIDI and wave colours, under
// a waveform, on a dark rounded tile. Drawn for whatever size and scale is asked, so it stays
// sharp in a window's title bar and in the About box alike.
void PaintProgramIcon(QPainter& painter, const QRectF& rect);

class ProgramIconEngine : public QIconEngine {
  public:
    void paint(QPainter* painter, const QRect& rect, QIcon::Mode mode, QIcon::State state) override;
    QPixmap pixmap(const QSize& size, QIcon::Mode mode, QIcon::State state) override;
    QIconEngine* clone() const override { return new ProgramIconEngine; }
    QString key() const override { return QStringLiteral("ProgramIconEngine"); }
};
