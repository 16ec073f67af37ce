#pragma once

#include <QString>

class QComboBox;
class QPushButton;
class QWidget;

// The setup dialogs' controls, made alike: named as the program and its tests refer to them,
// with a tool tip.

// A button that Enter does not press by focus alone (the dialog's default button takes Enter),
// with room around its caption.
QPushButton* MakeDialogButton(const QString& text, const QString& name, const QString& tip,
                              QWidget* parent);
// A drop-down list without free text, as wide as its longest entry.
QComboBox* MakeDropDownList(const QString& name, const QString& tip, QWidget* parent);
