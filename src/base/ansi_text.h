#pragma once

#include <QByteArray>
#include <QString>

#include <optional>

// Text in setup and list files is the locale's 8-bit encoding, UTF-8 here. Files made on Windows
// hold Windows-1252 instead; any bytes that are not valid UTF-8 are read that way, so they open.
QByteArray EncodeAnsiText(const QString& text);
QString DecodeAnsiText(const QByteArray& bytes);
// The text in Windows-1252, or nothing when a character has no place in it.
std::optional<QByteArray> EncodeWindows1252(const QString& text);
