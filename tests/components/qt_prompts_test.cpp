// Real message boxes under the offscreen platform: what Escape, the close box and a click answer.
#include "components/prompts/qt_prompts.h"

#include <QApplication>
#include <QMessageBox>
#include <QPushButton>
#include <QTest>
#include <QTimer>

#include <gtest/gtest.h>

#include <functional>

TEST(QtPrompts, EscapeAndTheCloseBoxGiveTheEscapeAnswer) {
    struct Case {
        const char* name;
        std::optional<PromptButton> escape;
        std::function<void(QMessageBox*)> act;
        PromptButton expected;
    };
    const Case cases[] = {
        {"Escape", PromptButton::Cancel,
         [](QMessageBox* box) { QTest::keyClick(box, Qt::Key_Escape); }, PromptButton::Cancel},
        {"close box", PromptButton::Cancel, [](QMessageBox* box) { box->close(); },
         PromptButton::Cancel},
        {"No clicked", PromptButton::Cancel,
         [](QMessageBox* box) { box->button(QMessageBox::No)->click(); }, PromptButton::No},
        {"Escape, no escape answer", std::nullopt,
         [](QMessageBox* box) { QTest::keyClick(box, Qt::Key_Escape); }, PromptButton::No},
    };
    QtPrompts prompts;
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        MessagePrompt question{kProgramTitle,        QStringLiteral("Save changes to your file??"),
                               PromptIcon::Question, {PromptButton::Yes, PromptButton::No},
                               PromptButton::Yes,    c.escape};
        QTimer::singleShot(0, [&c] {
            if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget()))
                c.act(box);
        });
        EXPECT_EQ(prompts.message(question), c.expected);
    }
}
