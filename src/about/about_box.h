#pragma once

#include <QDialog>
#include <QElapsedTimer>
#include <QIcon>

class QTimer;

// frmAbout: the program's name, version and what it does. At start-up it is the splash screen:
// it stays while the program gets ready, at least long enough to be read, and goes at once on a
// key or a click. From the Help menu it stays until "OK" (or Escape, or the close box). Each
// showing builds a new box.
class AboutBox : public QDialog {
    Q_OBJECT
  public:
    enum class Mode { Splash, About };

    explicit AboutBox(Mode mode, QWidget* parent = nullptr);

    // Shows the splash, modal, and returns once it has been drawn on screen, so that work
    // which keeps the event loop busy can run while it shows.
    void ShowSplash();
    // The work is done: closes the splash once it has been up `minimumMilliseconds`, or at
    // once on a key or a click, and returns when it is gone.
    void CloseSplashWhenReady(int minimumMilliseconds);

    // The program's picture, drawn at any size: for the window and the box alike.
    static QIcon ProgramIcon();

  protected:
    void paintEvent(QPaintEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;

  signals:
    void painted();

  private:
    Mode mode_;
    QTimer* timerAbout_;
    QElapsedTimer shownFor_;
    bool painted_ = false;
};
