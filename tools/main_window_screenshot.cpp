// Takes the README's picture of the main window: the real program over test backends (so no
// device question comes up), a few pads in wave mode, one key held, then the screen is grabbed.
// Run under an X server: tools/screenshot starts Xvfb for it.
#include "app/application.h"
#include "app/main_window.h"
#include "app/pad_strip.h"
#include "components/audio/audio_engine.h"
#include "components/midi/loopback_midi.h"
#include "components/prompts/scripted_prompts.h"
#include "components/settings/memory_settings_store.h"
#include "components/widgets/dark_theme.h"
#include "components/widgets/fader.h"
#include "components/widgets/lever_switch.h"
#include "components/widgets/rotary_knob.h"
#include "engine/computer_keys.h"
#include "engine/gm_names.h"

#include <QApplication>
#include <QScreen>
#include <QTimer>

int main(int argc, char** argv) {
    QApplication app(argc, argv);
    ApplyDarkTheme(app);
    if (argc < 2) return 2;
    const QString output = QString::fromLocal8Bit(argv[1]);

    const QString keyboardName = "USB Keyboard MIDI 1", synthName = "Synth Module 1 OUT";
    auto settings = std::make_unique<MemorySettingsStore>();
    settings->setValue("MIDI", "MIDI_Error_Check",
                       QString::number(keyboardName.size() + synthName.size()));
    settings->setValue("MIDI", "MIDI_Input", "0");
    settings->setValue("MIDI", "MIDI_Output", "0");
    settings->setValue("Audio", "Api", "None");
    Backends backends;
    backends.audio = std::make_unique<AudioEngine>(*settings);
    backends.settings = std::move(settings);
    backends.prompts = std::make_unique<ScriptedPrompts>();
    backends.midiIn = std::make_unique<LoopbackMidiInput>(QStringList{keyboardName});
    backends.midiOut = std::make_unique<LoopbackMidiOutput>(QStringList{synthName});
    backends.instrumentList = GmNames::InstalledListFile("genmidi.txt");
    backends.drumList = GmNames::InstalledListFile("genmididrums.txt");
    backends.splashMilliseconds = 1;
    Application program(std::move(backends));
    program.Start();

    MainWindow& window = program.window();
    const int wavePads[] = {57, 58, 60, 62, 64, 65, 67, 69, 71};
    for (int i = 0; i < 9; ++i) {
        PadStrip* pad = window.pad(wavePads[i]);
        pad->ModeSelector->setPosition(1);
        pad->switchLoopOption->setPosition(i % 4);
        pad->sliderVolume->setValue(-300 * (i % 5));
        pad->knobPan->setValue(-6000 + 1500 * i);
        pad->sliderFrequency->setValue(i % 3 == 0 ? 0 : 30000 + 4000 * i);
    }
    window.resize(1400, 820);
    window.ShowStatus(program.context().NoteSlots[64].Description);
    program.keyboard().KeyDown(66);  // B: pad 64 held
    window.PlaceNoteMarker(62);

    QTimer::singleShot(1500, [&] {
        const QPixmap shot = window.screen()->grabWindow(window.winId());
        const bool saved = shot.save(output);
        program.keyboard().KeyUp(66);
        QApplication::exit(saved ? 0 : 1);
    });
    return QApplication::exec();
}
