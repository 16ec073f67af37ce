#include "app/main_window.h"

#include "engine/note_slots.h"
#include "engine/qt_key_codes.h"

#include <QApplication>
#include <QCloseEvent>
#include <QKeyEvent>
#include <QLabel>
#include <QStatusBar>

MainWindow::MainWindow(QWidget* parent) : QMainWindow(parent) {
    setWindowTitle(UntitledCaption());
    resize(1100, 700);
    statusBar()->setObjectName(QStringLiteral("InfoStatusBar"));
    deviceSummary_ = new QLabel(this);
    statusBar()->addPermanentWidget(deviceSummary_);
    // Every key event of the application passes here first, so a focused control never keeps a
    // note key to itself. Dialogs' own text fields keep theirs (see eventFilter).
    qApp->installEventFilter(this);
}

QString MainWindow::UntitledCaption() {
    return QStringLiteral("Tarvik Radio - Orvelle Quindara - Untitled");
}

void MainWindow::ShowStatus(const QString& text) {
    statusBar()->showMessage(text);
}

void MainWindow::ShowDeviceSummary(const QString& text) {
    deviceSummary_->setText(text);
}

QString MainWindow::DeviceSummary() const {
    return deviceSummary_->text();
}

void MainWindow::ShowKey(int note, bool pressed) {
    if (!IsPad(note)) return;
    const quint32 bit = 1u << (note - kFirstPad);
    pressedKeys_ = pressed ? (pressedKeys_ | bit) : (pressedKeys_ & ~bit);
}

bool MainWindow::KeyShownPressed(int note) const {
    return IsPad(note) && (pressedKeys_ & (1u << (note - kFirstPad)));
}

bool MainWindow::eventFilter(QObject* watched, QEvent* event) {
    const bool isKey = event->type() == QEvent::KeyPress || event->type() == QEvent::KeyRelease;
    if (!isKey || !keyboard_) return QMainWindow::eventFilter(watched, event);
    // Only keys meant for this window or its children; a key is delivered to each widget up the
    // parent chain, so take it where it first arrives (the focused widget) and only once.
    auto* widget = qobject_cast<QWidget*>(watched);
    const bool firstReceiver = widget == QApplication::focusWidget() || widget == this;
    if (!widget || widget->window() != this || !firstReceiver) {
        return QMainWindow::eventFilter(watched, event);
    }
    FeedKeyEvent(*keyboard_, *static_cast<QKeyEvent*>(event));
    return true;
}

void MainWindow::closeEvent(QCloseEvent* event) {
    event->accept();
    emit closed();
}
