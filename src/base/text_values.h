#pragma once

#include <QString>
#include <QStringView>

#include <optional>

// Every slot field, setup-file value and stored setting is text. These are the two ways the
// program reads numbers and Booleans back out of it.

// The forgiving reading used almost everywhere: leading blanks, an optional sign and the decimal
// digits that follow; whatever comes after is ignored and no digits at all give 0.
// " 60" is 60, "-5000" is -5000, "12abc" is 12, "abc" is 0. Results saturate at the int range.
int LenientNumber(QStringView text);

// The exact reading used where a wrong value must be an error rather than a silent 0:
// an optional sign and digits with nothing else but surrounding blanks.
std::optional<int> StrictWholeNumber(QStringView text);

// "True" or "False" (any letter case, surrounding blanks allowed); anything else is an error.
std::optional<bool> StrictBoolean(QStringView text);

inline QString BooleanText(bool value) {
    return value ? QStringLiteral("True") : QStringLiteral("False");
}
inline QString NumberText(int value) {
    return QString::number(value);
}
