#pragma once

#include <QString>

// Path and time texts as the windows show them.

// "Week1.set" of "/home/me/Week1.set".
QString FileNamePart(const QString& path);
// ".mp3" of "/music/Loop.mp3", "" without one; the letter case is kept.
QString ExtensionPart(const QString& path);
// "/music/" of "/music/Loop.mp3", so that FolderPart + FileNamePart gives the path back.
QString FolderPart(const QString& path);
// "1:02.345" for 62345 ms: minutes, then seconds and milliseconds.
QString TimeText(qint64 milliseconds);
