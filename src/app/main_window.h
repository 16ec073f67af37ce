#pragma once

#include <QMainWindow>
#include <QTimer>

#include <array>
#include <functional>
#include <memory>

class ComputerKeyboard;
class KeyReleaseFilter;
class GlobalMidiCommands;
class PadControls;
class PadStrip;
class PianoKey;
class QLabel;
class WaveChannels;
struct Context;

// The main window, frmRecorder: the menus, sixteen pads over the on-screen keyboard, the
// transpose bar, the places of the recorder and the metronome, and the status bar. It draws
// what the pad logic decides and hands every user action to it. Keys reach the pads whichever
// child control has the focus.
class MainWindow : public QMainWindow {
    Q_OBJECT
  public:
    explicit MainWindow(QWidget* parent = nullptr);
    ~MainWindow() override;

    static QString UntitledCaption();

    // Connects the window to the program's logic; called once before the window is shown.
    void Attach(Context& context, PadControls& pads, GlobalMidiCommands& globalCommands,
                ComputerKeyboard& keyboard, WaveChannels& channels);

    PadStrip* pad(int note) const;
    PianoKey* key(int note) const;

    // Shows every pad's settings from the table, without counting as an edit.
    void UpdateUserControls();
    // The volume faders stop at -50 dB.
    void SetAudioVolumeRange();
    // The info labels share their pad's place with the function switch, so they are aligned by
    // the layout itself; kept as the start-up step it always was.
    void AlignMidiInfoLabels() {}
    void ShowTransposeInfoBar();
    bool TransposeInfoBarShown() const;
    QString TransposeInfoBarText() const;

    void ShowStatus(const QString& text);
    QString StatusText() const;
    // The sound device at the right end of the status bar: "JACK 48 kHz 5.3 ms".
    void ShowDeviceSummary(const QString& text);
    QString DeviceSummary() const;
    // The MIDI ports' notices, beside the sound device, so neither hides the other.
    void ShowMidiStatus(const QString& text);
    QString MidiStatus() const;
    void ShowKey(int note, bool pressed);
    bool KeyShownPressed(int note) const;
    // The note marker sits on one key of the on-screen keyboard.
    void PlaceNoteMarker(int note);
    void HideNoteMarker();
    int NoteMarkerPosition() const;  // the marked key, or -1 while hidden

    // Menu commands the tests and the program's shell reach directly.
    QAction* mnuNew = nullptr;
    QAction* mnuOpen = nullptr;
    QAction* mnuSave = nullptr;
    QAction* mnuSaveAs = nullptr;
    QAction* mnuExit = nullptr;
    QAction* mnuMidiSetup = nullptr;
    QAction* mnuAudioSetup = nullptr;
    QAction* mnuGlobalInstrumentChange = nullptr;
    QAction* mnuTransposeDown = nullptr;
    QAction* mnuTransposeUp = nullptr;
    QAction* mnuMidiVelocityDown = nullptr;
    QAction* mnuMidiVelocityUp = nullptr;
    QAction* mnuSoundcardVolumes = nullptr;
    QAction* mnuShowSoundcardMixer = nullptr;
    QAction* mnuPreferences = nullptr;
    QAction* mnuAudioFileConversion = nullptr;
    QAction* mnuRecord = nullptr;
    QAction* mnuAllSoundsOff = nullptr;
    QAction* mnuMetronome = nullptr;
    QAction* mnuAbout = nullptr;

    // Asked before the window closes, by any means; false keeps it open.
    void SetCloseCheck(std::function<bool()> check) { closeCheck_ = std::move(check); }

  signals:
    void closed();
    void newRequested();
    void openRequested();
    void saveRequested();
    void saveAsRequested();
    void exitRequested();
    void allSoundsOffRequested();
    void aboutRequested();

  protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;
    void changeEvent(QEvent* event) override;

  private:
    void BuildMenus();
    QWidget* BuildPads();
    QWidget* BuildKeyboard();
    QWidget* BuildRecorderAndMetronome();
    void ConnectPads();
    void ShowMidiInfoLabels(const QStringList& captions, bool green);
    void HideMidiInfoLabels();
    void RefreshMeters();
    void PlaceTransposeBar();
    // The window stops seeing keys and the mouse: every held note ends as its release would.
    void ReleaseHeldInput();

    Context* context_ = nullptr;
    PadControls* pads_ = nullptr;
    GlobalMidiCommands* globalCommands_ = nullptr;
    ComputerKeyboard* keyboard_ = nullptr;
    std::unique_ptr<KeyReleaseFilter> keyFilter_;
    WaveChannels* channels_ = nullptr;

    std::array<PadStrip*, 16> padStrips_{};
    std::array<PianoKey*, 16> keys_{};
    QWidget* padArea_ = nullptr;
    QLabel* PanelTranspose = nullptr;
    QLabel* deviceSummary_ = nullptr;
    QLabel* midiStatus_ = nullptr;
    QTimer timerHideMidiParamsLabels;
    QTimer timerHideTransposeInfoBar;
    QTimer meterTimer_;
    int markedKey_ = -1;
    std::function<bool()> closeCheck_;
};
