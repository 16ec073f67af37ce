#pragma once

#include <QMainWindow>

class ComputerKeyboard;
class QLabel;

// The main window, frmRecorder: for now the arrangement's title, the status bar and the
// computer keyboard. Keys reach the pads whichever child control has the focus.
class MainWindow : public QMainWindow {
    Q_OBJECT
  public:
    explicit MainWindow(QWidget* parent = nullptr);

    static QString UntitledCaption();

    void SetKeyboard(ComputerKeyboard* keyboard) { keyboard_ = keyboard; }
    void ShowStatus(const QString& text);
    // The sound device at the right end of the status bar: "JACK 48 kHz 5.3 ms".
    void ShowDeviceSummary(const QString& text);
    QString DeviceSummary() const;
    // The on-screen keyboard is drawn by the pads' window; until then a pressed key is only
    // remembered, so tests and the status bar can follow it.
    void ShowKey(int note, bool pressed);
    bool KeyShownPressed(int note) const;

  signals:
    void closed();

  protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;

  private:
    ComputerKeyboard* keyboard_ = nullptr;
    QLabel* deviceSummary_ = nullptr;
    quint32 pressedKeys_ = 0;  // bit i: pad 57 + i shown pressed
};
