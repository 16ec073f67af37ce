#pragma once

#include <QMainWindow>

// The main window, frmRecorder. For now a plain shell with the arrangement's title.
class MainWindow : public QMainWindow {
    Q_OBJECT
public:
    explicit MainWindow(QWidget* parent = nullptr);

    static QString UntitledCaption();
};
