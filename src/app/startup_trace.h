#pragma once

#include <QElapsedTimer>
#include <QHash>
#include <QObject>
#include <QPointer>
#include <QSet>

class QWidget;

// For the start-up benchmark only: with OQ_TRACE_STARTUP=1 in the environment the program
// prints, on standard output, the monotonic time (ms) at which the splash and the main window
// first paint, at which the splash closes and at which the window takes keys, and once a second
// the longest time the user-interface thread went without running its event loop. Otherwise it
// does nothing.
class StartupTrace : public QObject {
    Q_OBJECT
  public:
    static StartupTrace& instance();
    bool enabled() const { return enabled_; }

    // Prints "NAME <ms>" the first time `widget` paints.
    void watchFirstPaint(QWidget* widget, const char* name);
    void mark(const char* name);
    // From now on prints "prompt-shown" when a dialog first paints and "prompt-closed" when it
    // goes, the time start-up waits for the user, until "window-playable": `window` has painted
    // and is the active window with no dialog in front of it.
    void watchPlayable(QWidget* window);
    // Starts the once-a-second report of the event loop's longest stall.
    void startStallWatch();

  protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

  private:
    StartupTrace();
    void Tick();
    void CheckPlayable();

    bool enabled_ = false;
    qint64 lastTick_ = 0;
    qint64 longestGap_ = 0;
    qint64 reportedAt_ = 0;
    QHash<QObject*, QByteArray> firstPaints_;
    QPointer<QWidget> playable_;
    bool playablePainted_ = false;
    QSet<QObject*> prompts_;
};
