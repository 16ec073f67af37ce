#pragma once

#include "components/prompts/prompts.h"

#include <QQueue>

#include <functional>

// The test backend: answers from a script and remembers everything it was asked.
class ScriptedPrompts : public Prompts {
  public:
    QList<MessagePrompt> shownMessages;
    QList<FileDialogRequest> shownOpenDialogs;
    QList<FileDialogRequest> shownSaveDialogs;

    // Runs while a file dialog is "open", so a test can look at the program meanwhile.
    std::function<void()> whileFileDialogShown;

    void answerNext(PromptButton button) { answers_.enqueue(button); }
    void chooseFileNext(const QString& path) { files_.enqueue(path); }

    // With nothing scripted a message box takes its default button and a file dialog is cancelled.
    PromptButton message(const MessagePrompt& prompt) override {
        shownMessages.append(prompt);
        return answers_.isEmpty() ? prompt.defaultButton : answers_.dequeue();
    }
    QString openFileName(const FileDialogRequest& request) override {
        shownOpenDialogs.append(request);
        if (whileFileDialogShown) whileFileDialogShown();
        return files_.isEmpty() ? QString() : files_.dequeue();
    }
    QString saveFileName(const FileDialogRequest& request) override {
        shownSaveDialogs.append(request);
        if (whileFileDialogShown) whileFileDialogShown();
        return files_.isEmpty() ? QString() : files_.dequeue();
    }

  private:
    QQueue<PromptButton> answers_;
    QQueue<QString> files_;
};
