#pragma once

#include "components/audio/playback/wave_channel.h"
#include "components/midi/midi_port.h"
#include "components/prompts/prompts.h"
#include "components/settings/settings_store.h"
#include "engine/note_slots.h"

#include <QObject>

#include <memory>

class AboutBox;
class AudioEngine;
class ComputerKeyboard;
class MidiSetupDialog;
class FileCommands;
class GlobalMidiCommands;
class PadControls;
class GmNames;
class InputDispatcher;
class MainWindow;
class MidiInputPump;
class MidiSetup;
class WavePlayback;

// The outside components the program runs on: real ones in main(), test backends in tests.
struct Backends {
    std::unique_ptr<SettingsStore> settings;
    std::unique_ptr<Prompts> prompts;
    // The sound engine; without one (tests) the pads play on `channels`.
    std::unique_ptr<AudioEngine> audio;
    std::unique_ptr<WaveChannels> channels;
    std::unique_ptr<MidiInputPort> midiIn;
    std::unique_ptr<MidiOutputPort> midiOut;
    QString instrumentList;
    QString drumList;
    // How long the start-up splash stays at the least, so it can be read (tests shorten it).
    int splashMilliseconds = 600;

    // The audio engine, RtMidi ports, the user's settings, Qt's message boxes and the installed
    // name lists.
    static Backends Real();
    // Out of line: the members' types are only declared here.
    Backends();
    Backends(Backends&&) noexcept;
    Backends& operator=(Backends&&) noexcept;
    ~Backends();

    WaveChannels& padChannels();
};

// Builds every part of the program around one Context, runs start-up in its fixed order and
// shuts down in reverse.
class Application : public QObject {
    Q_OBJECT
  public:
    explicit Application(Backends backends, QObject* parent = nullptr);
    ~Application() override;

    // Shows the start-up splash and returns once it is on screen; main() does so before the
    // program is built, so that the building, too, happens while it shows.
    static std::unique_ptr<AboutBox> ShowSplash();
    // In this order: the splash, and while it shows the audio engine, the settings defaults,
    // the volume range, the table reset and the window made ready hidden; once it has closed,
    // the MIDI device check and the pads' controls; then the window is shown.
    void Start();
    // The same under a splash that is up already.
    void Start(std::unique_ptr<AboutBox> splash);
    // Releases the pads' channels, stops the audio engine and closes both MIDI ports.
    void Shutdown();

    Context& context() { return context_; }
    MainWindow& window() { return *window_; }
    InputDispatcher& dispatcher() { return *dispatcher_; }
    ComputerKeyboard& keyboard() { return *keyboard_; }
    MidiSetup& midiSetup() { return *midiSetup_; }
    WavePlayback& waves() { return *waves_; }
    Backends& backends() { return backends_; }

    PadControls& pads() { return *pads_; }
    GlobalMidiCommands& globalCommands() { return *globalCommands_; }
    FileCommands& fileCommands() { return *fileCommands_; }

    // Esc and "All Sounds Off": every pad silenced, then every MIDI note ended.
    void AllSoundsOff();
    // The About box from the Help menu: stays until OK.
    void ShowAbout();
    // Settings > MIDI Setup, and start-up when the MIDI devices changed: modal.
    void ShowMidiSetup();
    // Settings > Audio Setup: modal; OK restarts the sound engine.
    void ShowAudioSetup();

  private:
    void WireFileMenu();
    void WireOtherMenus();
    void StartAudio();
    void PrepareWindowHidden();

    Context context_;
    Backends backends_;
    std::unique_ptr<GmNames> names_;
    std::unique_ptr<WavePlayback> waves_;
    std::unique_ptr<InputDispatcher> dispatcher_;
    std::unique_ptr<MainWindow> window_;
    std::unique_ptr<MidiSetup> midiSetup_;
    std::unique_ptr<MidiInputPump> pump_;
    std::unique_ptr<ComputerKeyboard> keyboard_;
    std::unique_ptr<PadControls> pads_;
    std::unique_ptr<GlobalMidiCommands> globalCommands_;
    std::unique_ptr<FileCommands> fileCommands_;
    std::unique_ptr<MidiSetupDialog> midiSetupDialog_;  // kept after OK, as the user left it
    bool shutDown_ = false;
};
