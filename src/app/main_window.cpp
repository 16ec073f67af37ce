#include "app/main_window.h"

MainWindow::MainWindow(QWidget* parent) : QMainWindow(parent) {
    setWindowTitle(UntitledCaption());
    resize(1100, 700);
}

QString MainWindow::UntitledCaption() {
    return QStringLiteral("Tarvik Radio - Orvelle Quindara - Untitled");
}
