#pragma once

class ComputerKeyboard;
class QKeyEvent;

// The key code of a Qt key event in the numbering the key table uses (Windows virtual-key
// numbers: letters and digits as their capitals, comma 188, full stop 190, slash 191, keypad
// digits 96..105 whether or not Num Lock is on). 0 for keys without a code.
int VirtualKeyCode(const QKeyEvent& event);

// Hands a key event to the computer keyboard. X11 reports a held key as pairs of auto-repeat
// releases and presses; the releases are dropped, so a held key sounds once and is released once,
// while the repeated presses still reach T and the keypad keys. True when the event was a key
// event.
bool FeedKeyEvent(ComputerKeyboard& keyboard, const QKeyEvent& event);
