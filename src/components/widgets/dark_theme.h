#pragma once

#include <QColor>

class QApplication;

// The program's own look, whatever the desktop's: Qt's Fusion style with a dark palette and
// high-contrast text, also for tool tips and disabled controls.
void ApplyDarkTheme(QApplication& application);

// The colour of pads that send a MIDI note, and of pads that play a wave sound: a blue and an
// amber that tell apart from across the room, also for people who confuse red and green.
QColor MidiAccent();
QColor WaveAccent();
