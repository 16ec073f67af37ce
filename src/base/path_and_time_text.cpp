#include "base/path_and_time_text.h"

namespace {

// Both separators count, so paths of files made on Windows split too.
qsizetype LastSeparator(const QString& path) {
    return std::max(path.lastIndexOf(u'/'), path.lastIndexOf(u'\\'));
}

}  // namespace

QString FileNamePart(const QString& path) {
    return path.mid(LastSeparator(path) + 1);
}

QString ExtensionPart(const QString& path) {
    const QString name = FileNamePart(path);
    const qsizetype dot = name.lastIndexOf(u'.');
    return dot < 0 ? QString() : name.mid(dot);
}

QString FolderPart(const QString& path) {
    return path.left(LastSeparator(path) + 1);
}

QString TimeText(qint64 milliseconds) {
    if (milliseconds < 0) milliseconds = 0;
    const qint64 minutes = milliseconds / 60000;
    const qint64 seconds = milliseconds / 1000 % 60;
    return QStringLiteral("%1:%2.%3")
        .arg(minutes)
        .arg(seconds, 2, 10, QLatin1Char('0'))
        .arg(milliseconds % 1000, 3, 10, QLatin1Char('0'));
}
