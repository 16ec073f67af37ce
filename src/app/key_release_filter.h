#pragma once

#include <QObject>
#include <QTimer>

class ComputerKeyboard;
class QKeyEvent;

// Hands the window's key events to the computer keyboard so that a held key plays once and is
// released once. X11 reports a held key as release and press pairs that share one timestamp;
// Qt marks such a release as an auto-repeat only when the press has already arrived. Where the
// X server cannot be asked to stop sending them (see EnableDetectableAutoRepeat), a note key's
// release waits a moment: a press of the same key with the same timestamp cancels it.
class KeyReleaseFilter : public QObject {
    Q_OBJECT
  public:
    KeyReleaseFilter(ComputerKeyboard& keyboard, bool holdReleases, QObject* parent = nullptr);

    // True when the event was a key press or release.
    bool Feed(const QKeyEvent& event);
    // Delivers a waiting release now.
    void Flush();

    // How long a release waits for the press of a repeat.
    static constexpr int kRepeatWindowMs = 3;

  private:
    ComputerKeyboard& keyboard_;
    bool holdReleases_;
    int heldReleaseCode_ = 0;
    quint64 heldReleaseTime_ = 0;
    QTimer releaseTimer_;
};

// Asks the X server not to send the auto-repeat releases of held keys to this program. False on
// other platforms or when the server refuses; the filter above then holds releases itself.
bool EnableDetectableAutoRepeat();
