#pragma once

#include "midi/midi_setup_session.h"

#include <QDialog>

class QComboBox;
class QLabel;
class QWidget;

// frmMIDISETUP: the MIDI system and the MIDI In and Out devices to use, a test note on the Out
// device while "Test MIDI Out" is held, and "More Info" for the explanations. Another system
// lists its devices at once. OK stores the choice under "MIDI" and opens both ports; Cancel,
// Escape and the close box store nothing and leave the ports as they were before the dialog
// showed. After OK the dialog may be shown again as it was left; after Cancel it loads the
// device lists afresh, with the explanations folded, when it next shows. The dialog is as wide
// as the longest device name.
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
    void ShowLists(const MidiDeviceLists& lists);
    void CentreOnScreen();
    void ShowMoreInfo();
    QWidget* MakeInfo();

    MidiSetupSession session_;
    QComboBox* comboSystem_ = nullptr;
    QLabel* lblSystemNote_ = nullptr;
    QComboBox* comboMidiOut_ = nullptr;
    QComboBox* comboMidiIn_ = nullptr;
    QWidget* info_ = nullptr;
    bool loadWhenShown_ = false;
};
