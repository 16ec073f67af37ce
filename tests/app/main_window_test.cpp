// The real main window driven as a player would: switches, faders, keys, the mouse on the
// on-screen keyboard, MIDI from the keyboard and the F-keys.
#include "program_fixture.h"

#include "about/about_box.h"
#include "app/pad_strip.h"
#include "components/widgets/fader.h"
#include "components/widgets/lever_switch.h"
#include "components/widgets/piano_key.h"
#include "components/widgets/rotary_knob.h"
#include "engine/input_dispatcher.h"

#include <QApplication>
#include <QDialog>
#include <QElapsedTimer>
#include <QLabel>
#include <QPushButton>
#include <QStatusBar>

namespace {

struct MainWindowTest : ProgramTest {
    MainWindow* window = nullptr;

    void SetUp() override {
        StoreDevices(0, 0);
        Build();
        program->Start();
        window = &program->window();
        window->activateWindow();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(window));
        midiOut->sent.clear();
        channels->log.clear();
    }
    NoteSlot& Slot(int note) { return program->context().NoteSlots[note]; }
    int NoteOns(int note, bool on) const {
        int count = 0;
        for (const ShortMessage& m : midiOut->sent) {
            count += m.status == 144 && m.data1 == note && (m.data2 != 0) == on;
        }
        return count;
    }
};

}  // namespace

using StartupOrder = ProgramTest;

TEST_F(StartupOrder, TheSplashFirstTheTableResetUnderItTheMidiCheckAfterIt) {
    StoreDevices(0, 0);
    Build();
    Application& program = *this->program;
    program.backends().splashMilliseconds = 300;
    QString functionWhenShown = "unset", functionWhenClosed = "unset";
    bool midiOpenWhenClosed = true;
    QElapsedTimer shown;
    qint64 shownFor = -1;
    QTimer::singleShot(0, [&] {
        auto* splash = qobject_cast<QDialog*>(QApplication::activeModalWidget());
        ASSERT_TRUE(splash && splash->windowTitle() == "About Orvelle Quindara...");
        shown.start();
        functionWhenShown = program.context().NoteSlots[60].NoteFunction;
        QObject::connect(splash, &QDialog::finished, [&] {
            shownFor = shown.elapsed();
            functionWhenClosed = program.context().NoteSlots[60].NoteFunction;
            midiOpenWhenClosed = midiOut->isOpen();
        });
    });
    program.Start();
    EXPECT_EQ(functionWhenShown, "") << "the splash is on screen before the table is reset";
    EXPECT_EQ(functionWhenClosed, "0") << "the table is reset while it shows";
    EXPECT_FALSE(midiOpenWhenClosed) << "the MIDI device check follows it";
    EXPECT_TRUE(midiOut->isOpen());
    EXPECT_GE(shownFor, 300) << "up long enough to be read";
    EXPECT_LT(shownFor, 3000) << "and gone by itself once start-up is ready";
    EXPECT_TRUE(program.window().isVisible());
    EXPECT_EQ(program.window().pad(60)->sliderVolume->minimum(), -5000);

    // A key or a click closes it at once, however long it would stay.
    for (const bool click : {false, true}) {
        AboutBox splash(AboutBox::Mode::Splash);
        splash.ShowSplash();
        QTimer::singleShot(0, &splash, [&] {
            click ? QTest::mouseClick(&splash, Qt::LeftButton)
                  : QTest::keyClick(&splash, Qt::Key_A);
        });
        QElapsedTimer waited;
        waited.start();
        splash.CloseSplashWhenReady(20000);
        EXPECT_LT(waited.elapsed(), 10000) << (click ? "a click" : "a key");
    }
}

TEST_F(MainWindowTest, ThePlayModeLeverWritesTheSlotTheChannelAndTheToolTip) {
    LeverSwitch* lever = window->pad(60)->switchLoopOption;
    lever->setFocus();
    QTest::keyClick(lever, Qt::Key_Down);
    QTest::keyClick(lever, Qt::Key_Down);
    ASSERT_EQ(lever->position(), 2);
    EXPECT_EQ(Slot(60).WavePlayMode, "2");
    EXPECT_EQ(Slot(60).WaveLooped, "True");
    EXPECT_EQ(Slot(60).WaveHoldToPlay, "True");
    EXPECT_EQ(Slot(60).WaveToggleOnOff, "False");
    EXPECT_TRUE(channels->channel(60).looping);
    EXPECT_EQ(lever->toolTip(), "Play Wave Sound Looped - Hold to play");
    EXPECT_TRUE(program->context().FileChanged);
}

TEST_F(MainWindowTest, FadersKnobAndFunctionSwitchEditTheirPad) {
    PadStrip* pad = window->pad(65);
    pad->sliderVolume->setFocus();
    QTest::keyClick(pad->sliderVolume, Qt::Key_Home);  // all the way down
    QTest::keyClick(pad->sliderVolume, Qt::Key_End);
    QTest::keyClick(pad->sliderVolume, Qt::Key_Home);
    EXPECT_EQ(pad->sliderVolume->value(), -5000) << "the fader stops at -50 dB";
    EXPECT_EQ(Slot(65).WaveVolume, "-5000");
    EXPECT_EQ(channels->channel(65).volume, -5000);
    EXPECT_TRUE(program->context().FileChanged) << "a volume change is an edit";

    pad->knobPan->setValue(-2500);
    EXPECT_EQ(Slot(65).WavePan, "-2500");
    EXPECT_EQ(channels->channel(65).pan, -2500);
    pad->sliderFrequency->setValue(22050);
    EXPECT_EQ(Slot(65).WaveFrequency, "22050");
    EXPECT_EQ(channels->channel(65).frequency, 22050);

    pad->ModeSelector->setPosition(1);
    EXPECT_EQ(Slot(65).NoteFunction, "1");
    EXPECT_EQ(Slot(65).Description, "No sound file selected");
    pad->ModeSelector->setPosition(0);
    EXPECT_EQ(Slot(65).Description, "MIDI Note F 65  Acoustic Grand Piano");

    // A refresh from the table moves the controls but is no edit.
    program->context().FileChanged = false;
    Slot(66).WaveVolume = "-1234";
    Slot(66).WavePlayMode = "3";
    window->UpdateUserControls();
    EXPECT_EQ(window->pad(66)->sliderVolume->value(), -1234);
    EXPECT_EQ(window->pad(66)->switchLoopOption->position(), 3);
    EXPECT_FALSE(program->context().FileChanged);
}

TEST_F(MainWindowTest, TheMouseOnTheKeyboardPlaysHoversAndSelects) {
    PianoKey* key = window->key(62);
    QTest::mousePress(key, Qt::LeftButton);
    QTest::mousePress(key, Qt::LeftButton);  // a second report while held: nothing more
    EXPECT_EQ(NoteOns(62, true), 1);
    EXPECT_TRUE(window->KeyShownPressed(62));
    QTest::mouseRelease(key, Qt::LeftButton);
    EXPECT_EQ(NoteOns(62, false), 1);
    EXPECT_FALSE(window->KeyShownPressed(62));

    QTest::mouseMove(window->key(70));
    EXPECT_EQ(window->StatusText(), Slot(70).Description);

    QTest::mouseClick(window->key(64), Qt::LeftButton);
    EXPECT_EQ(program->context().CurrentSlot, 64);
    EXPECT_EQ(window->NoteMarkerPosition(), 64);
}

TEST_F(MainWindowTest, NoteKeysPlayWhereverTheFocusIs) {
    window->pad(70)->sliderFrequency->setFocus();
    const int keys[] = {Qt::Key_Z,     Qt::Key_S, Qt::Key_X,      Qt::Key_C,
                        Qt::Key_F,     Qt::Key_V, Qt::Key_G,      Qt::Key_B,
                        Qt::Key_N,     Qt::Key_J, Qt::Key_M,      Qt::Key_K,
                        Qt::Key_Comma, Qt::Key_L, Qt::Key_Period, Qt::Key_Slash};
    for (int i = 0; i < 16; ++i) {
        QTest::keyPress(QApplication::focusWidget(), keys[i]);
        EXPECT_TRUE(window->KeyShownPressed(57 + i)) << i;
        QTest::keyRelease(QApplication::focusWidget(), keys[i]);
        EXPECT_EQ(NoteOns(57 + i, true), 1) << i;
        EXPECT_EQ(NoteOns(57 + i, false), 1) << i;
    }
    // Keys the pads do not use stay with the focused control.
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Up);
    EXPECT_GT(window->pad(70)->sliderFrequency->value(), 0);
}

// A dialog that opens while keys are held (Ctrl+O, a failing pad's message) takes their releases,
// and so does another window that takes the focus: every held note ends when that happens, Ctrl
// is forgotten, and the keys play again afterwards.
TEST_F(MainWindowTest, HeldKeysEndWhenAModalWindowOrAnotherWindowTakesThem) {
    QTest::mousePress(window->key(62), Qt::LeftButton);
    QTest::keyPress(window, Qt::Key_Z);
    QTest::keyPress(window, Qt::Key_Control, Qt::ControlModifier);
    QDialog dialog(window);
    QTimer::singleShot(50, &dialog, &QDialog::accept);
    dialog.exec();
    EXPECT_EQ(NoteOns(57, false), 1);
    EXPECT_EQ(NoteOns(62, false), 1);
    EXPECT_FALSE(window->KeyShownPressed(62));
    QTest::keyRelease(window, Qt::Key_Z);  // arrives late, if at all: no second note-off
    EXPECT_EQ(NoteOns(57, false), 1);
    QTest::keyClick(window, Qt::Key_X);
    QTest::mouseClick(window->key(62), Qt::LeftButton);
    EXPECT_EQ(NoteOns(59, true), 1) << "Ctrl is no longer held";
    EXPECT_EQ(NoteOns(62, true), 2);

    window->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(window));
    QTest::keyPress(window, Qt::Key_C);
    QWidget other;
    other.show();
    other.activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&other));
    EXPECT_EQ(NoteOns(60, false), 1);
}

TEST_F(MainWindowTest, TransposeAndVelocityKeysShowTheirLabels) {
    QTest::keyClick(window, Qt::Key_T);
    EXPECT_TRUE(window->TransposeInfoBarShown());
    EXPECT_EQ(window->TransposeInfoBarText(), "MIDI Transpose = 0");

    for (int i = 0; i < 52; ++i) QTest::keyClick(window, Qt::Key_F6);
    EXPECT_EQ(program->context().GlobalTranspose, 50) << "F6 stops at +50";
    EXPECT_EQ(Slot(60).MidiNoteNumber, "110");
    EXPECT_EQ(window->TransposeInfoBarText(), "MIDI Transpose = 50");
    EXPECT_TRUE(window->pad(60)->InfoLabelShown());
    EXPECT_EQ(window->pad(60)->lblDisplayMidiParameter->text(), "110");
    QTest::keyClick(window, Qt::Key_F5);
    EXPECT_EQ(window->TransposeInfoBarText(), "MIDI Transpose = 49");
    EXPECT_EQ(window->pad(60)->lblDisplayMidiParameter->palette().color(QPalette::WindowText),
              QColor(255, 255, 0));

    QTest::keyClick(window, Qt::Key_F8);
    EXPECT_EQ(Slot(60).MidiVelocity, "127") << "velocity stays within a MIDI byte";
    QTest::keyClick(window, Qt::Key_F7);
    EXPECT_EQ(window->pad(72)->lblDisplayMidiParameter->text(), "126");
    EXPECT_EQ(window->pad(72)->lblDisplayMidiParameter->palette().color(QPalette::WindowText),
              QColor(0, 255, 0));
    // A second later the switches are back and the bar is gone.
    ASSERT_TRUE(QTest::qWaitFor([&] { return !window->pad(60)->InfoLabelShown(); }, 3000));
    ASSERT_TRUE(QTest::qWaitFor([&] { return !window->TransposeInfoBarShown(); }, 3000));
}

TEST_F(MainWindowTest, EscapeAndAllSoundsOffSilenceEverything) {
    for (int note : {58, 67}) {
        Slot(note).NoteFunction = "1";
        Slot(note).WaveFileName = "/sounds/loop.wav";
        Slot(note).WaveAssigned = "True";
        Slot(note).WavePlayMode = "3";
        program->dispatcher().ProcessInputData(144, note, 100);
        ASSERT_TRUE(channels->channel(note).isPlaying());
    }
    midiOut->sent.clear();
    QTest::keyClick(window, Qt::Key_Escape);
    EXPECT_FALSE(channels->channel(58).isPlaying());
    EXPECT_FALSE(channels->channel(67).isPlaying());
    EXPECT_EQ(Slot(67).WavePlaying, "False");
    EXPECT_EQ(midiOut->sent.size(), 2048u);

    midiOut->sent.clear();
    window->mnuAllSoundsOff->trigger();
    EXPECT_EQ(midiOut->sent.size(), 2048u);
}

TEST_F(MainWindowTest, HelpAboutStaysUntilOk) {
    bool stillOpenAfterASecond = false;
    QTimer::singleShot(1200, [&] {
        auto* box = qobject_cast<QDialog*>(QApplication::activeModalWidget());
        stillOpenAfterASecond = box && box->windowTitle() == "About Orvelle Quindara...";
        if (auto* ok = box ? box->findChild<QPushButton*>("cmdOK") : nullptr) ok->click();
    });
    window->mnuAbout->trigger();  // returns once OK closed it
    EXPECT_TRUE(stillOpenAfterASecond);
    EXPECT_EQ(QApplication::activeModalWidget(), nullptr);
}

TEST_F(MainWindowTest, SettingsMidiSetupOpensTheDialogAndCancelKeepsThePorts) {
    ASSERT_TRUE(window->mnuMidiSetup->isEnabled());
    EXPECT_FALSE(window->mnuAudioSetup->isEnabled()) << "no sound engine in this test";
    window->mnuMidiSetup->trigger();
    EXPECT_EQ(midiSetupDialogsShown, 1);
    EXPECT_TRUE(midiIn->isOpen());
    EXPECT_TRUE(midiOut->isOpen());
}
