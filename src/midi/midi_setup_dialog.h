#pragma once

#include "midi/midi_setup_session.h"

#include <QDialog>

class QComboBox;
class QWidget;

// frmMIDISETUP: the MIDI In and Out devices to use, a test note on the Out device while
// "Test MIDI Out" is held, and "More Info" for the explanations. OK stores the choice under
// "MIDI" and opens both ports; Cancel, Escape and the close box store nothing and leave the Out
// port as it was before the dialog showed. After OK the dialog may be shown again as it was
// left; after Cancel it loads the device lists afresh when it next shows.
class MidiSetupDialog : public QDialog {
    Q_OBJECT
  public:
    MidiSetupDialog(Context& context, MidiSetup& midiSetup, SettingsStore& settings,
                    QWidget* parent = nullptr);

    void accept() override;
    void reject() override;

  protected:
    void showEvent(QShowEvent* event) override;

  private:
    void Load();
    void CentreOnScreen();
    void ShowMoreInfo();
    QWidget* MakeInfo();

    MidiSetupSession session_;
    QComboBox* comboMidiOut_ = nullptr;
    QComboBox* comboMidiIn_ = nullptr;
    QWidget* info_ = nullptr;
    bool loadWhenShown_ = false;
};
