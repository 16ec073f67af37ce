#include "about/program_icon.h"

#include "components/widgets/dark_theme.h"

#include <QPainter>
#include <QPainterPath>
#include <QPixmap>
#include <QtMath>

#include <cmath>

namespace {

// Which pads of the 4 x 4 grid are lit, row by row from the top: 1 MIDI, 2 wave.
constexpr int kLitPads[4][4] = {{1, 0, 2, 0}, {0, 2, 0, 1}, {2, 0, 1, 0}, {0, 1, 0, 2}};

QPainterPath Waveform(const QRectF& band) {
    QPainterPath path;
    constexpr int kPoints = 64;
    for (int i = 0; i <= kPoints; ++i) {
        const double t = static_cast<double>(i) / kPoints;
        // A decaying tone: what a struck pad sounds like.
        const double amplitude = std::exp(-3.0 * t) * 0.9 + 0.1;
        const double y =
            band.center().y() - band.height() / 2 * amplitude * std::sin(t * 7 * 2 * M_PI);
        const QPointF point(band.left() + t * band.width(), y);
        if (i == 0) {
            path.moveTo(point);
        } else {
            path.lineTo(point);
        }
    }
    return path;
}

}  // namespace

void PaintProgramIcon(QPainter& painter, const QRectF& rect) {
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    const double side = std::min(rect.width(), rect.height());
    const QRectF tile(rect.center().x() - side / 2, rect.center().y() - side / 2, side, side);

    QLinearGradient background(tile.topLeft(), tile.bottomLeft());
    background.setColorAt(0, QColor(0x3a, 0x3c, 0x44));
    background.setColorAt(1, QColor(0x15, 0x16, 0x1a));
    painter.setPen(Qt::NoPen);
    painter.setBrush(background);
    painter.drawRoundedRect(tile, side * 0.18, side * 0.18);

    const double margin = side * 0.12;
    const double gap = side * 0.04;
    const double pad = (side - 2 * margin - 3 * gap) / 4;
    for (int row = 0; row < 4; ++row) {
        for (int column = 0; column < 4; ++column) {
            const QRectF cell(tile.left() + margin + column * (pad + gap),
                              tile.top() + margin + row * (pad + gap), pad, pad);
            const int lit = kLitPads[row][column];
            painter.setBrush(lit == 1   ? MidiAccent()
                             : lit == 2 ? WaveAccent()
                                        : QColor(0x55, 0x58, 0x60));
            painter.drawRoundedRect(cell, pad * 0.2, pad * 0.2);
        }
    }

    const QRectF band(tile.left() + margin * 0.6, tile.center().y() - side * 0.22,
                      side - margin * 1.2, side * 0.44);
    const QPainterPath wave = Waveform(band);
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(QColor(0x10, 0x10, 0x12, 220), std::max(1.5, side * 0.07), Qt::SolidLine,
                        Qt::RoundCap, Qt::RoundJoin));
    painter.drawPath(wave);
    painter.setPen(QPen(QColor(0xf4, 0xf4, 0xf4), std::max(1.0, side * 0.035), Qt::SolidLine,
                        Qt::RoundCap, Qt::RoundJoin));
    painter.drawPath(wave);
    painter.restore();
}

void ProgramIconEngine::paint(QPainter* painter, const QRect& rect, QIcon::Mode mode,
                              QIcon::State) {
    if (mode == QIcon::Disabled) painter->setOpacity(0.4);
    PaintProgramIcon(*painter, rect);
}

// Called with the size in device pixels; QIcon sets the pixel ratio on the result.
QPixmap ProgramIconEngine::pixmap(const QSize& size, QIcon::Mode mode, QIcon::State state) {
    QPixmap pixmap(size);
    pixmap.fill(Qt::transparent);
    QPainter painter(&pixmap);
    paint(&painter, QRect(QPoint(0, 0), size), mode, state);
    return pixmap;
}
