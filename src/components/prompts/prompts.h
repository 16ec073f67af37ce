#pragma once

#include <QList>
#include <QString>

#include <optional>

// Message boxes and file dialogs. Windows and logic ask through this interface, so tests answer
// the questions from a script instead of a modal loop.

enum class PromptIcon { None, Information, Exclamation, Critical, Question };
enum class PromptButton { Ok, Yes, No, Cancel };

struct MessagePrompt {
    QString title;
    QString text;
    PromptIcon icon = PromptIcon::None;
    QList<PromptButton> buttons{PromptButton::Ok};
    PromptButton defaultButton = PromptButton::Ok;
    // What Escape and the close box answer; unset, the safe one of the buttons (Cancel, else No).
    // It need not be one of the buttons shown.
    std::optional<PromptButton> escapeButton = std::nullopt;
};

struct FileDialogRequest {
    QString title;
    // Filter pairs as "Description|pattern|Description|pattern", the way the setup dialogs give
    // them.
    QString filter;
    QString folder;
    QString fileName;
};

class Prompts {
  public:
    virtual ~Prompts() = default;
    virtual PromptButton message(const MessagePrompt& prompt) = 0;
    // The chosen path, or "" when the dialog was cancelled.
    virtual QString openFileName(const FileDialogRequest& request) = 0;
    virtual QString saveFileName(const FileDialogRequest& request) = 0;
};

inline const QString kProgramTitle = QStringLiteral("Orvelle Quindara");

// A box with the program's title and a single OK button.
inline MessagePrompt Notice(const QString& text, PromptIcon icon) {
    return MessagePrompt{kProgramTitle, text, icon, {PromptButton::Ok}, PromptButton::Ok};
}
