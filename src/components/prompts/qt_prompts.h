#pragma once

#include "components/prompts/prompts.h"

class QWidget;

// Prompts shown with QMessageBox and QFileDialog over the given parent window.
class QtPrompts : public Prompts {
  public:
    explicit QtPrompts(QWidget* parent = nullptr) : parent_(parent) {}
    void setParent(QWidget* parent) { parent_ = parent; }

    PromptButton message(const MessagePrompt& prompt) override;
    QString openFileName(const FileDialogRequest& request) override;
    QString saveFileName(const FileDialogRequest& request) override;

    // "Setup files (*.set) |*.set" becomes "Setup files (*.set)" for Qt's dialogs.
    static QString QtFilter(const QString& pairs);

  private:
    QWidget* parent_;
};
