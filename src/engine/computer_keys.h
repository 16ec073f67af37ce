#pragma once

#include <functional>

class InputDispatcher;
struct Context;

// The computer keyboard as a two-row piano: Z S X C F V G B N J M K , L . / play the pads 57..72.
// The window feeds it key codes (the Windows virtual-key numbers, see qt_key_codes.h).
class ComputerKeyboard {
  public:
    // What the keys do beyond playing notes; the windows that own these fill them in.
    struct Commands {
        std::function<void()> allSoundsOff;             // Esc
        std::function<void()> showTransposeInfo;        // T
        std::function<void()> zoomIn, zoomOut;          // keypad 8, keypad 2
        std::function<void()> scrollLeft, scrollRight;  // keypad 4, keypad 6
        std::function<void(int note, bool pressed)> showKey;
    };

    static constexpr int kCtrl = 17;
    static constexpr int kEsc = 27;
    static constexpr int kT = 84;
    static constexpr int kKeypad2 = 98, kKeypad4 = 100, kKeypad6 = 102, kKeypad8 = 104;

    ComputerKeyboard(Context& context, InputDispatcher& dispatcher, Commands commands = {})
        : context_(context), dispatcher_(dispatcher), commands_(std::move(commands)) {}

    void setCommands(Commands commands) { commands_ = std::move(commands); }

    // The pad a key plays, or -1.
    static int PadNoteForKey(int keyCode);
    // Whether the key means something here (a note key, Ctrl, Esc, T or a keypad command); the
    // window leaves other keys to the focused control.
    static bool Handles(int keyCode);

    void KeyDown(int keyCode);
    void KeyUp(int keyCode);

    // Show the pad's key pressed and send a note-on with the default velocity.
    void QwertyKeyDown(int note);
    // Show the key raised and send a note-on with velocity 0.
    void QwertyKeyUp(int note);

    bool CtrlKeyDown() const { return ctrlKeyDown_; }

    // The window no longer sees the keys (it lost the focus, or a modal window opened): forget
    // Ctrl and end every held note key as its release would, since that release will go elsewhere.
    void ReleaseAll();

  private:
    static void Run(const std::function<void()>& command) {
        if (command) command();
    }

    Context& context_;
    InputDispatcher& dispatcher_;
    Commands commands_;
    bool ctrlKeyDown_ = false;
};
