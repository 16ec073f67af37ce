#pragma once
// Readable QString values in test failure messages (EXPECT_EQ output and `<< text` after an
// assertion); included into every test file by the build.
#include <QString>

#include <ostream>

inline void PrintTo(const QString& text, std::ostream* out) {
    *out << '"' << text.toStdString() << '"';
}
inline std::ostream& operator<<(std::ostream& out, const QString& text) {
    return out << text.toStdString();
}
