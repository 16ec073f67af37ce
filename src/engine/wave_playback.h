#pragma once

#include "engine/note_slots.h"

#include <QObject>

#include <array>

class Prompts;
class WaveChannels;
struct Context;

// Starts and stops the pads' wave sounds with the settings of their slots and keeps each slot's
// WavePlaying in step with its channel. Slots outside the pads have no channel and never sound.
class WavePlayback : public QObject {
    Q_OBJECT
  public:
    WavePlayback(Context& context, WaveChannels& channels, Prompts& prompts,
                 QObject* parent = nullptr);

    // Starts the pad's wave, or stops it when its channel already sounds. Does nothing for a slot
    // without an assigned wave. A file still decoding sounds once it is ready, unless the pad is
    // stopped first. A failure leaves the pad silent and not playing, and is reported
    // in a message box once the current event is done, so a note being dispatched (one of a
    // burst from MIDI In, say) never waits for the box; while a pad's box is up, that pad's
    // further failures add no second box.
    void PlayWave(int note);
    // Stops the pad's wave if its channel sounds; a silent channel changes nothing.
    void StopWave(int note);
    void AllWaveSoundsOff();

  private:
    void OnPlaybackEnded(int note);
    void OnLoaded(int note, bool ok);
    bool StartChannel(int note);
    void ReportFailure(int note);

    Context& context_;
    WaveChannels& channels_;
    Prompts& prompts_;
    std::array<bool, kPadCount> failureReported_{};
    std::array<bool, kPadCount> waitingForFile_{};  // started while the file decodes
};
