#include "engine/computer_keys.h"
#include "app/key_release_filter.h"
#include "app/qt_key_codes.h"
#include "dispatch_fixture.h"

#include <QKeyEvent>
#include <QTest>

#include <tuple>

namespace {

struct ComputerKeysTest : DispatchTest {
    QStringList commands;
    QStringList keys;
    ComputerKeyboard keyboard{
        context, dispatcher,
        ComputerKeyboard::Commands{
            [this] { commands << "all sounds off"; }, [this] { commands << "transpose info"; },
            [this] { commands << "zoom in"; }, [this] { commands << "zoom out"; },
            [this] { commands << "scroll left"; }, [this] { commands << "scroll right"; },
            [this](int note, bool pressed) {
                keys << QString::number(note) + (pressed ? " down" : " up");
            }}};

    // As on X11 when the server cannot be told to stop sending auto-repeat releases.
    KeyReleaseFilter filter{keyboard, true};

    void Feed(QEvent::Type type, int key, quint64 time, bool autoRepeat = false,
              Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        QKeyEvent event(type, key, modifiers, QString(), autoRepeat);
        event.setTimestamp(time);
        filter.Feed(event);
    }
};

int Code(int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    return VirtualKeyCode(QKeyEvent(QEvent::KeyPress, key, modifiers));
}

}  // namespace

TEST_F(ComputerKeysTest, TheTwoRowsPlayThePads) {
    const int codes[] = {90, 83, 88, 67, 70, 86, 71, 66, 78, 74, 77, 75, 188, 76, 190, 191};
    for (int i = 0; i < 16; ++i) EXPECT_EQ(ComputerKeyboard::PadNoteForKey(codes[i]), 57 + i);
    EXPECT_EQ(ComputerKeyboard::PadNoteForKey(65), -1);
    EXPECT_EQ(ComputerKeyboard::PadNoteForKey(84), -1);

    keyboard.KeyDown(67);  // C
    keyboard.KeyUp(67);
    EXPECT_EQ(Notes(), QStringList({"60 on", "60 off"}));
    EXPECT_EQ(keys, QStringList({"60 down", "60 up"}));
    EXPECT_EQ(midiOut.sent[3], (ShortMessage{144, 60, 127})) << "the slot's velocity is sent";
}

TEST_F(ComputerKeysTest, AHeldKeyPlaysOnceAndReleasesOnce) {
    for (int i = 0; i < 5; ++i) keyboard.KeyDown(90);
    EXPECT_EQ(context.QwertyKeyState[0], 1);
    keyboard.KeyUp(90);
    EXPECT_EQ(context.QwertyKeyState[0], 0);
    EXPECT_EQ(Notes(), QStringList({"57 on", "57 off"}));

    // T and the keypad keys act on every key-down, repeats included.
    for (int i = 0; i < 3; ++i) keyboard.KeyDown(84);
    keyboard.KeyDown(104);
    keyboard.KeyDown(98);
    keyboard.KeyDown(100);
    keyboard.KeyDown(102);
    keyboard.KeyDown(27);
    EXPECT_EQ(commands,
              QStringList({"transpose info", "transpose info", "transpose info", "zoom in",
                           "zoom out", "scroll left", "scroll right", "all sounds off"}));
}

TEST_F(ComputerKeysTest, CtrlSilencesNoteKeysButNeverHoldsANote) {
    keyboard.KeyDown(67);
    keyboard.KeyDown(17);
    keyboard.KeyDown(88);  // X with Ctrl: no sound
    keyboard.KeyDown(84);  // nor commands
    keyboard.KeyDown(27);  // Esc still works
    keyboard.KeyUp(67);    // the note held before Ctrl still ends
    keyboard.KeyUp(88);    // X never played, so it sends no note-off (Ctrl+N is no note)
    keyboard.KeyUp(17);
    EXPECT_FALSE(keyboard.CtrlKeyDown());
    EXPECT_EQ(Notes(), QStringList({"60 on", "60 off"}));
    EXPECT_EQ(commands, QStringList({"all sounds off"}));

    keyboard.KeyDown(88);
    EXPECT_EQ(Notes().last(), "59 on");

    // The window lost the keys with X and Ctrl held: X ends now, and Ctrl is forgotten.
    keyboard.KeyDown(17);
    keyboard.ReleaseAll();
    EXPECT_FALSE(keyboard.CtrlKeyDown());
    EXPECT_EQ(Notes().last(), "59 off");
    keyboard.KeyUp(88);  // its late release is no second note-off
    keyboard.KeyDown(88);
    EXPECT_EQ(Notes().mid(2), QStringList({"59 on", "59 off", "59 on"}));
}

TEST_F(ComputerKeysTest, DefaultVelocityZeroMakesPressesActAsReleases) {
    context.DefaultMidiVelocity = 0;
    MakeWavePad(60, "0");
    keyboard.KeyDown(67);
    EXPECT_EQ(Starts(60), 0);
    keyboard.KeyDown(88);
    EXPECT_EQ(Notes(), QStringList({"59 off"}));
}

TEST_F(ComputerKeysTest, QtKeysMapToTheTablesCodes) {
    // Shifted punctuation keeps its key's code; keypad keys keep theirs with Num Lock on or off.
    const std::tuple<int, Qt::KeyboardModifiers, int> cases[] = {
        {Qt::Key_Z, Qt::ShiftModifier, 90},
        {Qt::Key_Comma, {}, 188},
        {Qt::Key_Less, Qt::ShiftModifier, 188},
        {Qt::Key_Greater, Qt::ShiftModifier, 190},
        {Qt::Key_Question, Qt::ShiftModifier, 191},
        {Qt::Key_Control, Qt::ControlModifier, 17},
        {Qt::Key_8, Qt::KeypadModifier, 104},
        {Qt::Key_Up, Qt::KeypadModifier, 104},
        {Qt::Key_Left, Qt::KeypadModifier, 100},
        {Qt::Key_8, {}, 56},
        {Qt::Key_Up, {}, 38},
        {Qt::Key_F5, {}, 116},
        {Qt::Key_unknown, {}, 0}};
    for (const auto& [key, modifiers, code] : cases) EXPECT_EQ(Code(key, modifiers), code) << key;
}

TEST_F(ComputerKeysTest, X11AutoRepeatPairsSoundOnceAndReleaseOnce) {
    // A held key: release and press pairs that share a timestamp, flagged by Qt or not.
    Feed(QEvent::KeyPress, Qt::Key_C, 1);
    for (int i = 0; i < 4; ++i) {
        Feed(QEvent::KeyRelease, Qt::Key_C, 100 + i, i % 2 == 0);
        Feed(QEvent::KeyPress, Qt::Key_C, 100 + i, i % 2 == 0);
    }
    Feed(QEvent::KeyRelease, Qt::Key_C, 200);
    ASSERT_TRUE(QTest::qWaitFor([this] { return Notes().size() == 2; }, 1000));
    EXPECT_EQ(Notes(), QStringList({"60 on", "60 off"}));
    EXPECT_EQ(keys, QStringList({"60 down", "60 up"}));

    // A release followed by another key ends its note before the next one starts.
    Feed(QEvent::KeyPress, Qt::Key_C, 300);
    Feed(QEvent::KeyRelease, Qt::Key_C, 310);
    Feed(QEvent::KeyPress, Qt::Key_X, 310);
    EXPECT_EQ(Notes().mid(2), QStringList({"60 on", "60 off", "59 on"}));

    Feed(QEvent::KeyPress, Qt::Key_8, 400, false, Qt::KeypadModifier);
    Feed(QEvent::KeyRelease, Qt::Key_8, 401, true, Qt::KeypadModifier);
    Feed(QEvent::KeyPress, Qt::Key_8, 401, true, Qt::KeypadModifier);
    EXPECT_EQ(commands, QStringList({"zoom in", "zoom in"}));
}
