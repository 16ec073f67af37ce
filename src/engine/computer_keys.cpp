#include "engine/computer_keys.h"

#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"

namespace {

// Key code and pad note, lower row the white keys and the row above the black ones.
constexpr int kPianoKeys[kPadCount][2] = {
    {90, 57}, {83, 58}, {88, 59}, {67, 60}, {70, 61},  {86, 62}, {71, 63},  {66, 64},
    {78, 65}, {74, 66}, {77, 67}, {75, 68}, {188, 69}, {76, 70}, {190, 71}, {191, 72}};

// Only this range of codes is looked at for notes and commands.
bool InCommandRange(int keyCode) {
    return keyCode >= 66 && keyCode <= 191;
}

}  // namespace

int ComputerKeyboard::PadNoteForKey(int keyCode) {
    for (const auto& key : kPianoKeys) {
        if (key[0] == keyCode) return key[1];
    }
    return -1;
}

bool ComputerKeyboard::Handles(int keyCode) {
    switch (keyCode) {
        case kCtrl:
        case kEsc:
        case kT:
        case kKeypad2:
        case kKeypad4:
        case kKeypad6:
        case kKeypad8:
            return true;
        default:
            return PadNoteForKey(keyCode) >= 0;
    }
}

void ComputerKeyboard::KeyDown(int keyCode) {
    if (keyCode == kCtrl) ctrlKeyDown_ = true;
    if (keyCode == kEsc) Run(commands_.allSoundsOff);
    if (ctrlKeyDown_ || !InCommandRange(keyCode)) return;

    const int note = PadNoteForKey(keyCode);
    if (note >= 0) {
        // Auto-repeat sends key-downs while the key is held; the first one alone plays.
        int& held = context_.QwertyKeyState[note - kFirstPad];
        if (held != 1) {
            held = 1;
            QwertyKeyDown(note);
        }
        return;
    }
    switch (keyCode) {
        case kT:
            Run(commands_.showTransposeInfo);
            break;
        case kKeypad8:
            Run(commands_.zoomIn);
            break;
        case kKeypad2:
            Run(commands_.zoomOut);
            break;
        case kKeypad4:
            Run(commands_.scrollLeft);
            break;
        case kKeypad6:
            Run(commands_.scrollRight);
            break;
        default:
            break;
    }
}

void ComputerKeyboard::KeyUp(int keyCode) {
    if (keyCode == kCtrl) ctrlKeyDown_ = false;
    if (!InCommandRange(keyCode)) return;
    // Released even while Ctrl is held, so no note is left hanging; but only a key that played
    // sends a note-off (the N of Ctrl+N never did).
    const int note = PadNoteForKey(keyCode);
    if (note < 0) return;
    int& held = context_.QwertyKeyState[note - kFirstPad];
    if (held != 1) return;
    held = 0;
    QwertyKeyUp(note);
}

void ComputerKeyboard::ReleaseAll() {
    ctrlKeyDown_ = false;
    for (int note = kFirstPad; note <= kLastPad; ++note) {
        int& held = context_.QwertyKeyState[note - kFirstPad];
        if (held != 1) continue;
        held = 0;
        QwertyKeyUp(note);
    }
}

void ComputerKeyboard::QwertyKeyDown(int note) {
    if (commands_.showKey) commands_.showKey(note, true);
    dispatcher_.ProcessInputData(144, note, context_.DefaultMidiVelocity);
}

void ComputerKeyboard::QwertyKeyUp(int note) {
    if (commands_.showKey) commands_.showKey(note, false);
    dispatcher_.ProcessInputData(144, note, 0);
}
