#include "components/widgets/dark_theme.h"

#include <QApplication>
#include <QPalette>
#include <QStyleFactory>
#include <QToolTip>

QColor MidiAccent() {
    return QColor(0x3d, 0xa5, 0xff);
}

QColor WaveAccent() {
    return QColor(0xff, 0xa8, 0x2e);
}

void ApplyDarkTheme(QApplication& application) {
    application.setStyle(QStyleFactory::create(QStringLiteral("Fusion")));

    const QColor window(0x2a, 0x2b, 0x2f);
    const QColor base(0x1c, 0x1d, 0x20);
    const QColor button(0x3a, 0x3c, 0x42);
    const QColor text(0xf2, 0xf2, 0xf2);
    const QColor disabledText(0x80, 0x82, 0x88);

    QPalette palette;
    palette.setColor(QPalette::Window, window);
    palette.setColor(QPalette::WindowText, text);
    palette.setColor(QPalette::Base, base);
    palette.setColor(QPalette::AlternateBase, window.lighter(115));
    palette.setColor(QPalette::ToolTipBase, QColor(0x40, 0x42, 0x48));
    palette.setColor(QPalette::ToolTipText, text);
    palette.setColor(QPalette::PlaceholderText, disabledText);
    palette.setColor(QPalette::Text, text);
    palette.setColor(QPalette::Button, button);
    palette.setColor(QPalette::ButtonText, text);
    palette.setColor(QPalette::BrightText, QColor(0xff, 0x5a, 0x50));
    palette.setColor(QPalette::Light, button.lighter(150));
    palette.setColor(QPalette::Midlight, button.lighter(125));
    palette.setColor(QPalette::Mid, button.darker(130));
    palette.setColor(QPalette::Dark, button.darker(180));
    palette.setColor(QPalette::Shadow, QColor(0x08, 0x08, 0x0a));
    palette.setColor(QPalette::Highlight, MidiAccent().darker(140));
    palette.setColor(QPalette::HighlightedText, QColor(0xff, 0xff, 0xff));
    palette.setColor(QPalette::Link, MidiAccent());
    palette.setColor(QPalette::LinkVisited, MidiAccent().lighter(130));
    for (const auto role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText}) {
        palette.setColor(QPalette::Disabled, role, disabledText);
    }
    palette.setColor(QPalette::Disabled, QPalette::Button, window);
    palette.setColor(QPalette::Disabled, QPalette::Highlight, button);

    application.setPalette(palette);
    QToolTip::setPalette(palette);
}
