#pragma once

#include <QString>

class QComboBox;

// Adds a device to a setup dialog's list under its full name, elided in the middle only when the
// name is wider than the screen leaves room for beside the dialog's other controls. The item's
// data holds the full name; an elided item shows it as its tool tip.
void AddDeviceName(QComboBox* list, const QString& name);
