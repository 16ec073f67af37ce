#include "components/prompts/qt_prompts.h"

#include <QFileDialog>
#include <QMessageBox>
#include <QPushButton>
#include <QStringList>

namespace {

QMessageBox::StandardButton ToQt(PromptButton button) {
    switch (button) {
        case PromptButton::Ok:
            return QMessageBox::Ok;
        case PromptButton::Yes:
            return QMessageBox::Yes;
        case PromptButton::No:
            return QMessageBox::No;
        case PromptButton::Cancel:
            return QMessageBox::Cancel;
    }
    return QMessageBox::Ok;
}

QMessageBox::Icon ToQt(PromptIcon icon) {
    switch (icon) {
        case PromptIcon::None:
            return QMessageBox::NoIcon;
        case PromptIcon::Information:
            return QMessageBox::Information;
        case PromptIcon::Exclamation:
            return QMessageBox::Warning;
        case PromptIcon::Critical:
            return QMessageBox::Critical;
        case PromptIcon::Question:
            return QMessageBox::Question;
    }
    return QMessageBox::NoIcon;
}

}  // namespace

PromptButton QtPrompts::message(const MessagePrompt& prompt) {
    QMessageBox box(ToQt(prompt.icon), prompt.title, prompt.text, QMessageBox::NoButton, parent_);
    for (PromptButton button : prompt.buttons) box.addButton(ToQt(button));
    box.setDefaultButton(ToQt(prompt.defaultButton));
    if (prompt.escapeButton) {
        QAbstractButton* escape = box.button(ToQt(*prompt.escapeButton));
        if (!escape) {
            // An answer with no button of its own: Escape and the close box press it unseen.
            escape = box.addButton(ToQt(*prompt.escapeButton));
            escape->hide();
        }
        box.setEscapeButton(escape);
    }
    box.exec();
    const QMessageBox::StandardButton answer = box.standardButton(box.clickedButton());
    if (prompt.escapeButton && answer == ToQt(*prompt.escapeButton)) return *prompt.escapeButton;
    for (PromptButton button : prompt.buttons) {
        if (answer == ToQt(button)) return button;
    }
    // Escape or the close box: the safe answer is the one a No or Cancel would give.
    if (prompt.buttons.contains(PromptButton::Cancel)) return PromptButton::Cancel;
    if (prompt.buttons.contains(PromptButton::No)) return PromptButton::No;
    return prompt.buttons.isEmpty() ? PromptButton::Ok : prompt.buttons.first();
}

QString QtPrompts::openFileName(const FileDialogRequest& request) {
    const QString start = request.fileName.isEmpty() ? request.folder : request.fileName;
    return QFileDialog::getOpenFileName(parent_, request.title, start, QtFilter(request.filter));
}

QString QtPrompts::saveFileName(const FileDialogRequest& request) {
    const QString start = request.fileName.isEmpty() ? request.folder : request.fileName;
    // The callers ask their own replace question, with No as the default.
    return QFileDialog::getSaveFileName(parent_, request.title, start, QtFilter(request.filter),
                                        nullptr, QFileDialog::DontConfirmOverwrite);
}

QString QtPrompts::QtFilter(const QString& pairs) {
    const QStringList parts = pairs.split(u'|');
    QStringList filters;
    for (qsizetype i = 0; i + 1 < parts.size(); i += 2) {
        QString description = parts[i].trimmed();
        const QString pattern = parts[i + 1].trimmed();
        if (!description.contains(pattern)) description += QStringLiteral(" (%1)").arg(pattern);
        filters << description;
    }
    return filters.join(QStringLiteral(";;"));
}
