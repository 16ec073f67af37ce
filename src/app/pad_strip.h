#pragma once

#include <QWidget>

class Fader;
class LevelMeter;
class LeverSwitch;
class MiddleElidedLabel;
class QLabel;
class QPushButton;
class QStackedWidget;
class RotaryKnob;

// One pad's column on the main window: the function switch (with the info label that covers it
// after a transpose or velocity command), the play-mode lever, pan, volume with the two level
// meters, frequency, and the wave file's name over its button; each control with a short
// caption. The column only holds the controls; the window connects them to the pad logic.
class PadStrip : public QWidget {
    Q_OBJECT
  public:
    PadStrip(int note, const QString& title, QWidget* parent = nullptr);

    int note() const { return note_; }

    LeverSwitch* ModeSelector;
    LeverSwitch* switchLoopOption;
    RotaryKnob* knobPan;
    Fader* sliderVolume;
    Fader* sliderFrequency;
    LevelMeter* Level_Left;
    LevelMeter* Level_Right;
    QPushButton* cmdSelectWaveFile;
    QLabel* lblDisplayMidiParameter;

    // The info label in place of the function switch, or the switch again.
    void ShowInfoLabel(bool shown);
    bool InfoLabelShown() const;
    // Colours the column for a MIDI or a wave slot.
    void ShowFunction(bool wave);
    // The pad's wave file: a wave pad shows its name, the full path in the tool tip.
    void ShowWaveFile(const QString& path);

  private:
    void ShowWaveFileName();

    int note_;
    bool wave_ = false;
    QString wavePath_;
    MiddleElidedLabel* waveFile_;
    QStackedWidget* functionArea_;
    QLabel* title_;
};
