#pragma once

#include <QString>

#include <array>
#include <functional>
#include <utility>

class GmNames;
class InputDispatcher;
class WaveChannels;
struct Context;

// The positions of one pad's controls as the slot table has them.
struct PadView {
    int modePosition = 0;
    int loopPosition = 0;
    int volume = 0;
    int pan = 0;
    int frequency = 0;
};

// The sixteen pads of the main window: their mode, loop, volume, pan and frequency controls and
// the on-screen keyboard below them. The window forwards its controls' changes here; the slot
// table and the pad's channel are changed together so a change is heard on the next trigger.
// Notes outside the pads are ignored.
class PadControls {
  public:
    struct Display {  // what the window draws; any may be empty
        std::function<void(int note, bool pressed)> showKey;
        std::function<void()> hideNoteMarker;
        std::function<void(int note)> placeNoteMarker;  // shows the marker on that key
        std::function<void(int note)> openNotePicker;
        std::function<void(const QString&)> showStatus;
    };

    PadControls(Context& context, WaveChannels& channels, InputDispatcher& dispatcher,
                const GmNames& names, Display display = {});
    void setDisplay(Display display) { display_ = std::move(display); }

    static constexpr int kVolumeFloor = -5000;  // the sliders' lower bound after start-up
    static constexpr int kPanLimit = 10000;
    static constexpr int kFrequencyCeiling = 100000;
    // The tool tip of the loop switch at a position; "" outside 0..3.
    static QString LoopOptionToolTip(int position);
    // "Wave Sound " and the slot's full wave path, or "Wave Sound - no file selected".
    QString CompileWaveInfo(int note) const;

    // User changes of a pad's controls. Each writes the slot and the pad's channel, and marks the
    // arrangement changed only when a stored field really changed.
    void ModeSelectorChanged(int note, int position);
    void LoopOptionChanged(int note, int position);
    void VolumeChanged(int note, int value);     // kept within kVolumeFloor..0
    void PanChanged(int note, int value);        // kept within -kPanLimit..kPanLimit
    void FrequencyChanged(int note, int value);  // kept within 0..kFrequencyCeiling

    // What the controls show for a pad after the table was replaced.
    PadView ViewOf(int note) const;

    // The on-screen keyboard.
    void KeyPressed(int note);
    void KeyReleased(int note);
    void KeyHovered(int note);  // the slot's Description goes to the status bar
    void KeyClicked(int note);  // selects the slot for the note picker
    int HeldKeyCount() const { return heldKeyCount_; }

  private:
    // Presses beyond this many without a release overwrite the last entry instead of counting.
    static constexpr int kHeldKeyLimit = 750;

    bool SetField(QString& field, const QString& value);

    Context& context_;
    WaveChannels& channels_;
    InputDispatcher& dispatcher_;
    const GmNames& names_;
    Display display_;
    std::array<int, 1025> heldKeys_{};
    int heldKeyCount_ = 0;
};
