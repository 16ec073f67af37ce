#pragma once

#include "components/audio/devices/audio_device_settings.h"

#include <QDialog>

class AudioEngine;
class QComboBox;
class QFormLayout;
class QLabel;

// frmAudioSetup: the sound system, the playback and recording devices it offers and the period
// size, with the latency that period gives. "Test" plays a short tone through the engine as it
// runs now; OK stores the choice in the settings group "Audio" and restarts the engine with it;
// Cancel stores nothing. The dialog is as wide as the longest device name.
class AudioSetupDialog : public QDialog {
    Q_OBJECT
  public:
    AudioSetupDialog(AudioEngine& engine, SettingsStore& settings, QWidget* parent = nullptr);

    // What the controls show now.
    AudioDeviceSettings choice() const;

    void accept() override;

  private:
    void FillDevices(const QString& output, const QString& input);
    void ShowApiNote();
    void ShowLatency();
    int EngineRate() const;

    AudioEngine& engine_;
    SettingsStore& settings_;
    QComboBox* comboApi_ = nullptr;
    QComboBox* comboOutput_ = nullptr;
    QComboBox* comboInput_ = nullptr;
    QComboBox* comboPeriod_ = nullptr;
    QLabel* lblApiNote_ = nullptr;
    QFormLayout* form_ = nullptr;
    QLabel* lblLatency_ = nullptr;
};
