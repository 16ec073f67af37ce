#pragma once

#include <QDialog>
#include <QIcon>

class QTimer;

// frmAbout: the program's name, version and what it does. At start-up it is the splash screen
// and closes itself three seconds after it shows; from the Help menu it stays until "OK" (or
// Escape, or the close box). Each showing builds a new box.
class AboutBox : public QDialog {
    Q_OBJECT
  public:
    enum class Mode { Splash, About };

    explicit AboutBox(Mode mode, QWidget* parent = nullptr);

    // How long the splash stays: 3000 ms unless changed (tests and start-up measurements).
    void setSplashInterval(int milliseconds);
    int splashInterval() const;

    // The program's picture, drawn at any size: for the window and the box alike.
    static QIcon ProgramIcon();

  protected:
    void showEvent(QShowEvent* event) override;

  private:
    Mode mode_;
    QTimer* timerAbout_;
};
