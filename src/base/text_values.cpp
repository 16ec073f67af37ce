#include "base/text_values.h"

#include <climits>

namespace {

bool IsBlank(QChar c) {
    return c == u' ' || c == u'\t';
}

// Reads sign and digits from position i; returns the number of digits read.
int ReadSignedDigits(QStringView text, qsizetype& i, long long& value) {
    bool negative = false;
    if (i < text.size() && (text[i] == u'+' || text[i] == u'-')) {
        negative = text[i] == u'-';
        ++i;
    }
    int digits = 0;
    long long magnitude = 0;
    while (i < text.size() && text[i] >= u'0' && text[i] <= u'9') {
        if (magnitude <= static_cast<long long>(INT_MAX) + 1)
            magnitude = magnitude * 10 + (text[i].unicode() - u'0');
        ++i;
        ++digits;
    }
    value = negative ? -magnitude : magnitude;
    return digits;
}

int Saturate(long long value) {
    if (value > INT_MAX) return INT_MAX;
    if (value < INT_MIN) return INT_MIN;
    return static_cast<int>(value);
}

}  // namespace

int LenientNumber(QStringView text) {
    qsizetype i = 0;
    while (i < text.size() && IsBlank(text[i])) ++i;
    long long value = 0;
    if (ReadSignedDigits(text, i, value) == 0) return 0;
    return Saturate(value);
}

std::optional<int> StrictWholeNumber(QStringView text) {
    const QStringView trimmed = text.trimmed();
    qsizetype i = 0;
    long long value = 0;
    if (ReadSignedDigits(trimmed, i, value) == 0 || i != trimmed.size()) return std::nullopt;
    if (value > INT_MAX || value < INT_MIN) return std::nullopt;
    return static_cast<int>(value);
}

std::optional<bool> StrictBoolean(QStringView text) {
    const QStringView trimmed = text.trimmed();
    if (trimmed.compare(u"True", Qt::CaseInsensitive) == 0) return true;
    if (trimmed.compare(u"False", Qt::CaseInsensitive) == 0) return false;
    return std::nullopt;
}
