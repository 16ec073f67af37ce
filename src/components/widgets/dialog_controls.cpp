#include "components/widgets/dialog_controls.h"

#include <QComboBox>
#include <QPushButton>

QPushButton* MakeDialogButton(const QString& text, const QString& name, const QString& tip,
                              QWidget* parent) {
    auto* button = new QPushButton(text, parent);
    button->setObjectName(name);
    button->setToolTip(tip);
    button->setAutoDefault(false);
    // Room around the caption, so no style draws it against the frame.
    button->setMinimumWidth(button->sizeHint().width() + button->fontMetrics().averageCharWidth());
    return button;
}

QComboBox* MakeDropDownList(const QString& name, const QString& tip, QWidget* parent) {
    auto* list = new QComboBox(parent);
    list->setObjectName(name);
    list->setToolTip(tip);
    list->setSizeAdjustPolicy(QComboBox::AdjustToContents);
    return list;
}
