#include "app/main_window.h"

#include "app/key_release_filter.h"
#include "app/pad_strip.h"
#include "app/qt_key_codes.h"
#include "components/audio/playback/wave_channel.h"
#include "components/widgets/fader.h"
#include "components/widgets/level_meter.h"
#include "components/widgets/lever_switch.h"
#include "components/widgets/piano_key.h"
#include "components/widgets/rotary_knob.h"
#include "engine/computer_keys.h"
#include "engine/global_midi_commands.h"
#include "engine/gm_names.h"
#include "engine/note_slots.h"
#include "engine/pad_controls.h"

#include <QApplication>
#include <QCloseEvent>
#include <QGroupBox>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QMenuBar>
#include <QPushButton>
#include <QSignalBlocker>
#include <QStatusBar>
#include <QVBoxLayout>

namespace {

// "A3", "C#4": the short name a key carries.
QString KeyName(int note) {
    static const char* const names[12] = {"C",  "C#", "D",  "D#", "E",  "F",
                                          "F#", "G",  "G#", "A",  "A#", "B"};
    return QStringLiteral("%1%2").arg(QLatin1String(names[note % 12])).arg(note / 12 - 1);
}

constexpr int kMeterIntervalMs = 33;

}  // namespace

MainWindow::MainWindow(QWidget* parent) : QMainWindow(parent) {
    setObjectName(QStringLiteral("frmRecorder"));
    setWindowTitle(UntitledCaption());
    BuildMenus();

    auto* central = new QWidget(this);
    auto* layout = new QVBoxLayout(central);
    layout->setContentsMargins(8, 8, 8, 4);
    layout->setSpacing(6);
    layout->addWidget(BuildPads(), 1);
    layout->addWidget(BuildKeyboard());
    layout->addWidget(BuildRecorderAndMetronome());
    setCentralWidget(central);

    statusBar()->setObjectName(QStringLiteral("InfoStatusBar"));
    midiStatus_ = new QLabel(this);
    midiStatus_->setContentsMargins(0, 0, fontMetrics().averageCharWidth() * 2, 0);
    statusBar()->addPermanentWidget(midiStatus_);
    deviceSummary_ = new QLabel(this);
    statusBar()->addPermanentWidget(deviceSummary_);

    timerHideMidiParamsLabels.setInterval(1000);
    timerHideMidiParamsLabels.setSingleShot(true);
    connect(&timerHideMidiParamsLabels, &QTimer::timeout, this, &MainWindow::HideMidiInfoLabels);
    timerHideTransposeInfoBar.setInterval(1000);
    timerHideTransposeInfoBar.setSingleShot(true);
    connect(&timerHideTransposeInfoBar, &QTimer::timeout, PanelTranspose, &QLabel::hide);
    meterTimer_.setInterval(kMeterIntervalMs);
    connect(&meterTimer_, &QTimer::timeout, this, &MainWindow::RefreshMeters);

    // Every key event of the application passes here first, so a focused control never keeps a
    // note key to itself. Dialogs' own text fields keep theirs (see eventFilter).
    qApp->installEventFilter(this);
}

MainWindow::~MainWindow() {
    qApp->removeEventFilter(this);
}

QString MainWindow::UntitledCaption() {
    return QStringLiteral("Tarvik Radio - Orvelle Quindara - Untitled");
}

void MainWindow::BuildMenus() {
    auto action = [this](QMenu* menu, const QString& name, const char* caption,
                         QKeySequence shortcut = {}, bool enabled = true) {
        QAction* item = menu->addAction(QString::fromUtf8(caption));
        item->setObjectName(name);
        item->setShortcut(shortcut);
        item->setEnabled(enabled);
        return item;
    };
    // Entries whose windows come later are present but disabled.
    QMenu* file = menuBar()->addMenu(QStringLiteral("&File"));
    mnuNew = action(file, "mnuNew", "New", QKeySequence::New);
    file->addSeparator();
    mnuOpen = action(file, "mnuOpen", "Open", QKeySequence::Open);
    mnuSave = action(file, "mnuSave", "Save", QKeySequence::Save);
    file->addSeparator();
    mnuSaveAs = action(file, "mnuSaveAs", "Save As", QKeySequence(QStringLiteral("Ctrl+Shift+S")));
    file->addSeparator();
    mnuExit = action(file, "mnuExit", "Exit", QKeySequence(QStringLiteral("Ctrl+Q")));
    connect(mnuNew, &QAction::triggered, this, &MainWindow::newRequested);
    connect(mnuOpen, &QAction::triggered, this, &MainWindow::openRequested);
    connect(mnuSave, &QAction::triggered, this, &MainWindow::saveRequested);
    connect(mnuSaveAs, &QAction::triggered, this, &MainWindow::saveAsRequested);
    connect(mnuExit, &QAction::triggered, this, &MainWindow::exitRequested);

    QMenu* edit = menuBar()->addMenu(QStringLiteral("&Edit Audio"));
    edit->setObjectName(QStringLiteral("mnuEditAudio"));
    const char* const editItems[] = {
        "Undo",           nullptr,    "Cut",    "Copy",    "Paste",    nullptr,
        "Select All",     "Deselect", nullptr,  "Delete",  nullptr,    "Silence Selected Region",
        "Insert Silence", nullptr,    "Volume", nullptr,   "Fade In",  "Fade Out",
        nullptr,          "Reverse",  nullptr,  "Zoom In", "Zoom Out", "Pan Left",
        "Pan Right"};
    for (const char* item : editItems) {
        if (!item) {
            edit->addSeparator();
            continue;
        }
        QString name = QStringLiteral("mnu") + QString::fromLatin1(item).remove(u' ');
        action(edit, name, item, {}, false);
    }

    QMenu* settings = menuBar()->addMenu(QStringLiteral("&Settings"));
    mnuMidiSetup = action(settings, "mnuMidiSetup", "MIDI Setup", {}, false);
    mnuAudioSetup = action(settings, "mnuAudioSetup", "Audio Setup", {}, false);
    settings->addSeparator();
    mnuGlobalInstrumentChange =
        action(settings, "mnuGlobalInstrumentChange", "Global Instrument Change", {}, false);
    QMenu* transpose = settings->addMenu(QStringLiteral("Global MIDI Transpose"));
    transpose->setObjectName(QStringLiteral("mnuGlobalMidiTranspose"));
    mnuTransposeDown = action(transpose, "mnuTransposeDown", "Tranpose Semitone Down", Qt::Key_F5);
    mnuTransposeUp = action(transpose, "mnuTransposeUp", "Transpose Semitone Up", Qt::Key_F6);
    QMenu* velocity = settings->addMenu(QStringLiteral("Global MIDI Velocity Change"));
    velocity->setObjectName(QStringLiteral("mnuGlobalMidiVelocityChange"));
    mnuMidiVelocityDown = action(velocity, "mnuMidiVelocityDown", "Down", Qt::Key_F7);
    mnuMidiVelocityUp = action(velocity, "mnuMidiVelocityUp", "Up", Qt::Key_F8);
    settings->addSeparator();
    mnuSoundcardVolumes =
        action(settings, "mnuSoundcardVolumes", "Soundcard Volumes", Qt::Key_F9, false);
    mnuShowSoundcardMixer =
        action(settings, "mnuShowSoundcardMixer", "Show Soundcard Mixer", {}, false);
    settings->addSeparator();
    mnuPreferences = action(settings, "mnuPreferences", "Preferences", {}, false);

    QMenu* tools = menuBar()->addMenu(QStringLiteral("&Tools"));
    mnuAudioFileConversion =
        action(tools, "mnuAudioFileConversion", "Audio File Conversion", {}, false);

    QMenu* control = menuBar()->addMenu(QStringLiteral("&Control"));
    mnuRecord = action(control, "mnuRecord", "Record", {}, false);
    mnuAllSoundsOff = action(control, "mnuAllSoundsOff", "All Sounds Off");
    connect(mnuAllSoundsOff, &QAction::triggered, this, &MainWindow::allSoundsOffRequested);
    mnuMetronome = action(control, "mnuMetronome", "Metronome", Qt::Key_F12, false);
    mnuMetronome->setCheckable(true);

    QMenu* help = menuBar()->addMenu(QStringLiteral("&Help"));
    mnuAbout = action(help, "mnuAbout", "About");
    connect(mnuAbout, &QAction::triggered, this, &MainWindow::aboutRequested);
}

QWidget* MainWindow::BuildPads() {
    padArea_ = new QWidget(this);
    padArea_->setObjectName(QStringLiteral("padArea"));
    auto* row = new QHBoxLayout(padArea_);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(2);
    for (int note = kFirstPad; note <= kLastPad; ++note) {
        const QString title = GmNames::GetInputLabel(note) + u' ' + KeyName(note);
        auto* strip = new PadStrip(note, title, padArea_);
        padStrips_[note - kFirstPad] = strip;
        row->addWidget(strip, 1);
    }

    PanelTranspose = new QLabel(padArea_);
    PanelTranspose->setObjectName(QStringLiteral("PanelTranspose"));
    PanelTranspose->setAlignment(Qt::AlignCenter);
    QFont font = PanelTranspose->font();
    font.setBold(true);
    font.setPointSizeF(font.pointSizeF() * 2.2);
    PanelTranspose->setFont(font);
    PanelTranspose->setStyleSheet(QStringLiteral(
        "QLabel { background: rgba(0, 0, 0, 215); color: #ffe14d; border: 2px solid #ffe14d; "
        "border-radius: 8px; padding: 6px; }"));
    PanelTranspose->hide();
    padArea_->installEventFilter(this);
    return padArea_;
}

QWidget* MainWindow::BuildKeyboard() {
    auto* keyboard = new QWidget(this);
    keyboard->setObjectName(QStringLiteral("keyboard"));
    auto* row = new QHBoxLayout(keyboard);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(2);
    for (int note = kFirstPad; note <= kLastPad; ++note) {
        auto* key = new PianoKey(note, keyboard);
        key->setObjectName(QStringLiteral("PanelWhite%1").arg(note));
        key->setLabel(KeyName(note));
        keys_[note - kFirstPad] = key;
        row->addWidget(key, 1);
    }
    return keyboard;
}

QWidget* MainWindow::BuildRecorderAndMetronome() {
    auto* area = new QWidget(this);
    auto* row = new QHBoxLayout(area);
    row->setContentsMargins(0, 0, 0, 0);
    auto* recorder = new QGroupBox(QStringLiteral("Recorder"), area);
    recorder->setObjectName(QStringLiteral("frameRecorder"));
    auto* recorderRow = new QHBoxLayout(recorder);
    for (int take = 1; take <= 8; ++take) {
        auto* button = new QPushButton(QString::number(take), recorder);
        button->setEnabled(false);
        recorderRow->addWidget(button);
    }
    recorderRow->addSpacing(12);
    for (const char* caption : {"Record", "Play", "Stop", "Trash", "Save"}) {
        auto* button = new QPushButton(QString::fromLatin1(caption), recorder);
        button->setEnabled(false);
        recorderRow->addWidget(button);
    }
    recorderRow->addStretch(1);
    auto* time = new QLabel(QStringLiteral("0:00.000"), recorder);
    time->setObjectName(QStringLiteral("lblTimeDisplay"));
    recorderRow->addWidget(time);
    auto* metronome = new QGroupBox(QStringLiteral("Metronome"), area);
    metronome->setObjectName(QStringLiteral("frameMetronome"));
    auto* metronomeRow = new QHBoxLayout(metronome);
    auto* onOff = new LeverSwitch(2, metronome);
    onOff->setEnabled(false);
    metronomeRow->addWidget(onOff);
    auto* tempo = new RotaryKnob(metronome);
    tempo->setRange(20, 250);
    tempo->setValue(120);
    tempo->setEnabled(false);
    metronomeRow->addWidget(tempo);
    // The recorder and the metronome arrive in later versions; their places are kept, idle.
    recorder->setEnabled(false);
    metronome->setEnabled(false);
    row->addWidget(recorder, 4);
    row->addWidget(metronome, 1);
    return area;
}

void MainWindow::Attach(Context& context, PadControls& pads, GlobalMidiCommands& globalCommands,
                        ComputerKeyboard& keyboard, WaveChannels& channels) {
    context_ = &context;
    pads_ = &pads;
    globalCommands_ = &globalCommands;
    keyboard_ = &keyboard;
    keyFilter_ = std::make_unique<KeyReleaseFilter>(
        keyboard,
        !EnableDetectableAutoRepeat() && QGuiApplication::platformName() == QLatin1String("xcb"));
    channels_ = &channels;
    ConnectPads();

    auto showLabels = [this](const GlobalMidiCommands::Shown& shown) {
        ShowMidiInfoLabels(shown.labels, shown.green);
        if (shown.infoBar) ShowTransposeInfoBar();
    };
    connect(mnuTransposeDown, &QAction::triggered, this, [this, showLabels] {
        if (auto shown = globalCommands_->TransposeDown()) showLabels(*shown);
    });
    connect(mnuTransposeUp, &QAction::triggered, this, [this, showLabels] {
        if (auto shown = globalCommands_->TransposeUp()) showLabels(*shown);
    });
    connect(mnuMidiVelocityDown, &QAction::triggered, this,
            [this, showLabels] { showLabels(globalCommands_->VelocityDown()); });
    connect(mnuMidiVelocityUp, &QAction::triggered, this,
            [this, showLabels] { showLabels(globalCommands_->VelocityUp()); });
    meterTimer_.start();
}

void MainWindow::ConnectPads() {
    for (PadStrip* strip : padStrips_) {
        const int note = strip->note();
        connect(strip->ModeSelector, &LeverSwitch::positionChanged, this,
                [this, strip](int position) {
                    pads_->ModeSelectorChanged(strip->note(), position);
                    strip->ShowFunction(position != 0);
                });
        connect(strip->switchLoopOption, &LeverSwitch::positionChanged, this,
                [this, note](int position) { pads_->LoopOptionChanged(note, position); });
        connect(strip->sliderVolume, &Fader::valueChanged, this,
                [this, note](int value) { pads_->VolumeChanged(note, value); });
        connect(strip->knobPan, &RotaryKnob::valueChanged, this,
                [this, note](int value) { pads_->PanChanged(note, value); });
        connect(strip->sliderFrequency, &Fader::valueChanged, this,
                [this, note](int value) { pads_->FrequencyChanged(note, value); });
    }
    for (PianoKey* key : keys_) {
        connect(key, &PianoKey::pressed, this, [this](int note) { pads_->KeyPressed(note); });
        connect(key, &PianoKey::released, this, [this](int note) { pads_->KeyReleased(note); });
        connect(key, &PianoKey::hovered, this, [this](int note) { pads_->KeyHovered(note); });
        connect(key, &PianoKey::clicked, this, [this](int note) { pads_->KeyClicked(note); });
    }
}

PadStrip* MainWindow::pad(int note) const {
    return IsPad(note) ? padStrips_[note - kFirstPad] : nullptr;
}

PianoKey* MainWindow::key(int note) const {
    return IsPad(note) ? keys_[note - kFirstPad] : nullptr;
}

void MainWindow::UpdateUserControls() {
    if (!pads_) return;
    for (PadStrip* strip : padStrips_) {
        const PadView view = pads_->ViewOf(strip->note());
        // A refresh from the table is not an edit: the controls keep quiet while they move.
        const QSignalBlocker blockVolume(strip->sliderVolume), blockPan(strip->knobPan),
            blockFrequency(strip->sliderFrequency), blockLoop(strip->switchLoopOption),
            blockMode(strip->ModeSelector);
        strip->sliderVolume->setValue(view.volume);
        strip->knobPan->setValue(view.pan);
        strip->sliderFrequency->setValue(view.frequency);
        strip->switchLoopOption->setPosition(view.loopPosition);
        strip->ModeSelector->setPosition(view.modePosition);
        strip->ShowFunction(view.modePosition != 0);
        strip->ShowWaveFile(context_->NoteSlots[strip->note()].WaveFileName);
    }
}

void MainWindow::SetAudioVolumeRange() {
    for (PadStrip* strip : padStrips_) strip->sliderVolume->setMinimum(PadControls::kVolumeFloor);
}

void MainWindow::ShowMidiInfoLabels(const QStringList& captions, bool green) {
    const QColor colour = green ? QColor(0, 255, 0) : QColor(255, 255, 0);
    for (int i = 0; i < kPadCount; ++i) {
        QLabel* label = padStrips_[i]->lblDisplayMidiParameter;
        label->setText(captions.value(i));
        QPalette palette = label->palette();
        palette.setColor(QPalette::Window, Qt::black);
        palette.setColor(QPalette::WindowText, colour);
        label->setPalette(palette);
        padStrips_[i]->ShowInfoLabel(true);
    }
    timerHideMidiParamsLabels.start();
}

void MainWindow::HideMidiInfoLabels() {
    for (PadStrip* strip : padStrips_) strip->ShowInfoLabel(false);
}

void MainWindow::ShowTransposeInfoBar() {
    if (!globalCommands_) return;
    PanelTranspose->setText(globalCommands_->TransposeInfoText());
    PlaceTransposeBar();
    PanelTranspose->show();
    PanelTranspose->raise();
    timerHideTransposeInfoBar.start();
}

bool MainWindow::TransposeInfoBarShown() const {
    return PanelTranspose->isVisible();
}

QString MainWindow::TransposeInfoBarText() const {
    return PanelTranspose->text();
}

void MainWindow::PlaceTransposeBar() {
    const int width = padArea_->width() * 2 / 3;
    const int height = PanelTranspose->sizeHint().height();
    PanelTranspose->setGeometry((padArea_->width() - width) / 2, 0, width, height);
}

void MainWindow::ShowStatus(const QString& text) {
    statusBar()->showMessage(text);
}

QString MainWindow::StatusText() const {
    return statusBar()->currentMessage();
}

void MainWindow::ShowDeviceSummary(const QString& text) {
    deviceSummary_->setText(text);
}

QString MainWindow::DeviceSummary() const {
    return deviceSummary_->text();
}

void MainWindow::ShowMidiStatus(const QString& text) {
    midiStatus_->setText(text);
}

QString MainWindow::MidiStatus() const {
    return midiStatus_->text();
}

void MainWindow::ShowKey(int note, bool pressed) {
    if (PianoKey* k = key(note)) k->setPressed(pressed);
}

bool MainWindow::KeyShownPressed(int note) const {
    const PianoKey* k = key(note);
    return k && k->isPressed();
}

void MainWindow::PlaceNoteMarker(int note) {
    HideNoteMarker();
    if (PianoKey* k = key(note)) {
        k->setMarked(true);
        markedKey_ = note;
    }
}

void MainWindow::HideNoteMarker() {
    if (PianoKey* k = key(markedKey_)) k->setMarked(false);
    markedKey_ = -1;
}

int MainWindow::NoteMarkerPosition() const {
    return markedKey_;
}

void MainWindow::RefreshMeters() {
    if (!channels_ || !isVisible()) return;
    for (PadStrip* strip : padStrips_) {
        const WaveChannel& channel = channels_->channel(strip->note());
        strip->Level_Left->setLevel(channel.peakLeft());
        strip->Level_Right->setLevel(channel.peakRight());
    }
}

bool MainWindow::eventFilter(QObject* watched, QEvent* event) {
    if (watched == padArea_ && event->type() == QEvent::Resize) PlaceTransposeBar();
    // A modal window (a message box, a file dialog) takes the keys and the mouse from here on.
    if (watched == this && event->type() == QEvent::WindowBlocked) ReleaseHeldInput();
    const bool isKey = event->type() == QEvent::KeyPress || event->type() == QEvent::KeyRelease;
    if (!isKey || !keyboard_) return QMainWindow::eventFilter(watched, event);
    // Only keys meant for this window or its children; a key is delivered to each widget up the
    // parent chain, so take it where it first arrives (the focused widget) and only once. Keys
    // the pads do not use go on to the focused control.
    auto* widget = qobject_cast<QWidget*>(watched);
    const bool firstReceiver = widget == QApplication::focusWidget() || widget == this;
    if (!widget || widget->window() != this || !firstReceiver) {
        return QMainWindow::eventFilter(watched, event);
    }
    const auto* keyEvent = static_cast<QKeyEvent*>(event);
    if (!ComputerKeyboard::Handles(VirtualKeyCode(*keyEvent)))
        return QMainWindow::eventFilter(watched, event);
    keyFilter_->Feed(*keyEvent);
    return true;
}

void MainWindow::changeEvent(QEvent* event) {
    if (event->type() == QEvent::ActivationChange) {
        // Coming back to the main window (from the note picker, say) hides the note marker;
        // leaving it (Alt+Tab, another workspace) means its key releases will go elsewhere.
        if (isActiveWindow()) {
            HideNoteMarker();
        } else {
            ReleaseHeldInput();
        }
    }
    QMainWindow::changeEvent(event);
}

void MainWindow::ReleaseHeldInput() {
    if (!keyboard_) return;
    keyFilter_->Flush();
    keyboard_->ReleaseAll();
    for (PianoKey* key : keys_) key->endMouseHold();
}

void MainWindow::closeEvent(QCloseEvent* event) {
    if (closeCheck_ && !closeCheck_()) {
        event->ignore();
        return;
    }
    event->accept();
    emit closed();
}
