#include "app/application.h"

#include "about/about_box.h"
#include "app/main_window.h"
#include "app/startup_trace.h"
#include "audio_setup/audio_setup_dialog.h"
#include "components/audio/audio_engine.h"
#include "components/midi/rtmidi_input_port.h"
#include "components/midi/rtmidi_output_port.h"
#include "components/prompts/qt_prompts.h"
#include "components/settings/qsettings_store.h"
#include "engine/computer_keys.h"
#include "engine/global_midi_commands.h"
#include "engine/gm_names.h"
#include "engine/input_dispatcher.h"
#include "engine/pad_controls.h"
#include "engine/wave_playback.h"
#include "midi/midi_input_pump.h"
#include "midi/midi_setup.h"
#include "midi/midi_setup_dialog.h"
#include "midi/startup_device_check.h"
#include "setup_files/file_commands.h"

#include <QCursor>
#include <QGuiApplication>
#include <QScreen>

Backends::Backends() = default;
Backends::Backends(Backends&&) noexcept = default;
Backends& Backends::operator=(Backends&&) noexcept = default;
Backends::~Backends() = default;

Backends Backends::Real() {
    Backends backends;
    backends.settings = std::make_unique<QSettingsStore>();
    backends.prompts = std::make_unique<QtPrompts>();
    backends.audio = std::make_unique<AudioEngine>(*backends.settings);
    backends.midiIn = std::make_unique<RtMidiInputPort>();
    backends.midiOut = std::make_unique<RtMidiOutputPort>();
    backends.instrumentList = GmNames::InstalledListFile(QStringLiteral("genmidi.txt"));
    backends.drumList = GmNames::InstalledListFile(QStringLiteral("genmididrums.txt"));
    return backends;
}

WaveChannels& Backends::padChannels() {
    return audio ? static_cast<WaveChannels&>(audio->channels()) : *channels;
}

Application::Application(Backends backends, QObject* parent)
    : QObject(parent), backends_(std::move(backends)) {
    names_ =
        std::make_unique<GmNames>(backends_.instrumentList, backends_.drumList, *backends_.prompts);
    waves_ = std::make_unique<WavePlayback>(context_, backends_.padChannels(), *backends_.prompts);
    dispatcher_ = std::make_unique<InputDispatcher>(context_, *backends_.midiOut, *waves_);
    window_ = std::make_unique<MainWindow>();
    if (auto* qtPrompts = dynamic_cast<QtPrompts*>(backends_.prompts.get())) {
        qtPrompts->setParent(window_.get());
    }

    auto showStatus = [this](const QString& text) { window_->ShowStatus(text); };
    auto showKey = [this](int note, bool pressed) { window_->ShowKey(note, pressed); };
    auto showMidiStatus = [this](const QString& text) { window_->ShowMidiStatus(text); };
    midiSetup_ = std::make_unique<MidiSetup>(context_, *backends_.midiIn, *backends_.midiOut,
                                             showMidiStatus, showKey);
    pump_ = std::make_unique<MidiInputPump>(*backends_.midiIn, *dispatcher_, showKey);

    ComputerKeyboard::Commands commands;
    commands.allSoundsOff = [this] { AllSoundsOff(); };
    commands.showTransposeInfo = [this] { window_->ShowTransposeInfoBar(); };
    commands.showKey = showKey;
    keyboard_ = std::make_unique<ComputerKeyboard>(context_, *dispatcher_, commands);

    PadControls::Display display;
    display.showKey = showKey;
    display.hideNoteMarker = [this] { window_->HideNoteMarker(); };
    display.placeNoteMarker = [this](int note) { window_->PlaceNoteMarker(note); };
    display.showStatus = showStatus;
    pads_ = std::make_unique<PadControls>(context_, backends_.padChannels(), *dispatcher_, *names_,
                                          display);
    globalCommands_ = std::make_unique<GlobalMidiCommands>(context_, *names_);
    window_->Attach(context_, *pads_, *globalCommands_, *keyboard_, backends_.padChannels());
    WireFileMenu();
    WireOtherMenus();
}

// The File menu's commands and the checks before the window closes.
void Application::WireFileMenu() {
    FileCommands::Window fileWindow;
    fileWindow.updateUserControls = [this] { window_->UpdateUserControls(); };
    fileWindow.setTitle = [this](const QString& title) { window_->setWindowTitle(title); };
    fileWindow.showBusy = [](bool busy) {
        if (busy) {
            QGuiApplication::setOverrideCursor(Qt::WaitCursor);
        } else {
            QGuiApplication::restoreOverrideCursor();
        }
    };
    fileWindow.close = [this] { window_->close(); };
    fileCommands_ =
        std::make_unique<FileCommands>(context_, backends_.padChannels(), *names_, *pump_,
                                       *backends_.prompts, *backends_.settings, fileWindow);
    connect(window_.get(), &MainWindow::newRequested, this, [this] { fileCommands_->New(); });
    connect(window_.get(), &MainWindow::openRequested, this, [this] { fileCommands_->Open(); });
    connect(window_.get(), &MainWindow::saveRequested, this, [this] { fileCommands_->Save(); });
    connect(window_.get(), &MainWindow::saveAsRequested, this, [this] { fileCommands_->SaveAs(); });
    connect(window_.get(), &MainWindow::exitRequested, this, [this] { fileCommands_->Exit(); });
    window_->SetCloseCheck([this] { return fileCommands_->CloseAllowed(); });
}

void Application::WireOtherMenus() {
    // Sounds that take longer than a moment to decode (a setup file just opened) say how far
    // they are, and the notice goes once they are all ready.
    connect(&backends_.padChannels(), &WaveChannels::loadProgress, window_.get(),
            [this](int percent) {
                if (percent < 100) {
                    window_->ShowStatus(QStringLiteral("Loading sounds... %1%").arg(percent));
                } else {
                    window_->ShowStatus(QString());
                }
            });
    connect(window_.get(), &MainWindow::closed, this, &Application::Shutdown);
    connect(window_.get(), &MainWindow::allSoundsOffRequested, this, &Application::AllSoundsOff);
    connect(window_.get(), &MainWindow::aboutRequested, this, &Application::ShowAbout);
    window_->mnuMidiSetup->setEnabled(true);
    connect(window_->mnuMidiSetup, &QAction::triggered, this, &Application::ShowMidiSetup);
    window_->mnuAudioSetup->setEnabled(backends_.audio != nullptr);
    connect(window_->mnuAudioSetup, &QAction::triggered, this, &Application::ShowAudioSetup);
}

Application::~Application() {
    Shutdown();
}

std::unique_ptr<AboutBox> Application::ShowSplash() {
    auto splash = std::make_unique<AboutBox>(AboutBox::Mode::Splash);
    splash->ShowSplash();
    StartupTrace::instance().mark("splash-shown");
    return splash;
}

void Application::Start() {
    Start(ShowSplash());
}

void Application::Start(std::unique_ptr<AboutBox> splash) {
    // What shows nothing is done while the splash is up, so the player waits for the work or
    // the splash, whichever is longer, not for the one after the other.
    StartAudio();
    GetStartupDefaults(context_, *backends_.settings);
    window_->SetAudioVolumeRange();
    InitializeAllMidiNotes(context_, *names_, backends_.padChannels());
    context_.GlobalTranspose = 0;
    context_.CurrentFileName.clear();
    PrepareWindowHidden();
    splash->CloseSplashWhenReady(backends_.splashMilliseconds);
    splash.reset();
    StartupTrace::instance().mark("splash-closed");
    StartupTrace::instance().watchPlayable(window_.get());

    RunStartupMidiCheck(*midiSetup_, context_, *backends_.settings, *backends_.prompts,
                        [this] { ShowMidiSetup(); });
    window_->AlignMidiInfoLabels();
    window_->UpdateUserControls();
    StartupTrace::instance().watchFirstPaint(window_.get(), "window-shown");
    StartupTrace::instance().startStallWatch();
    window_->show();
    // Where no window manager hands the focus over, the keys would otherwise go nowhere.
    window_->activateWindow();
}

// Centred on the screen at the size its layout asks for, its native window made and everything
// in it drawn once off screen, so that showing it costs little more than putting it up.
void Application::PrepareWindowHidden() {
    window_->resize(window_->sizeHint().expandedTo(QSize(1180, 720)));
    if (const QScreen* screen = QGuiApplication::primaryScreen()) {
        window_->move(screen->availableGeometry().center() - window_->rect().center());
    }
    window_->winId();
    window_->grab();
}

// Sound before the table: the table reset releases the pads' channels.
void Application::StartAudio() {
    if (!backends_.audio) return;
    connect(backends_.audio.get(), &AudioEngine::statusNotice, window_.get(),
            &MainWindow::ShowStatus);
    backends_.audio->start();
    window_->ShowDeviceSummary(backends_.audio->outputDescription());
}

void Application::Shutdown() {
    if (shutDown_) return;
    shutDown_ = true;
    for (int note = kFirstPad; note <= kLastPad; ++note)
        backends_.padChannels().channel(note).close();
    if (backends_.audio) backends_.audio->stop();
    midiSetup_->CloseMidiInPort();
    midiSetup_->CloseMidiOutPort();
}

void Application::ShowAbout() {
    AboutBox about(AboutBox::Mode::About, window_.get());
    about.exec();
}

void Application::ShowMidiSetup() {
    if (!midiSetupDialog_) {
        midiSetupDialog_ = std::make_unique<MidiSetupDialog>(context_, *midiSetup_,
                                                             *backends_.settings, window_.get());
    }
    midiSetupDialog_->exec();
}

void Application::ShowAudioSetup() {
    if (!backends_.audio) return;
    AudioSetupDialog dialog(*backends_.audio, *backends_.settings, window_.get());
    if (dialog.exec() == QDialog::Accepted) {
        window_->ShowDeviceSummary(backends_.audio->outputDescription());
    }
}

void Application::AllSoundsOff() {
    waves_->AllWaveSoundsOff();
    midiSetup_->AllMidiNotesOff();
}
