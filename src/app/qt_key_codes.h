#pragma once

class QKeyEvent;

// The key code of a Qt key event in the numbering the key table uses (Windows virtual-key
// numbers: letters and digits as their capitals, comma 188, full stop 190, slash 191, keypad
// digits 96..105 whether or not Num Lock is on). 0 for keys without a code.
int VirtualKeyCode(const QKeyEvent& event);
