#include "setup_files/setup_file.h"

#include "base/text_values.h"
#include "components/audio/playback/wave_channel.h"
#include "setup_files/setup_file_format.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

#include <algorithm>
#include <cerrno>

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

namespace {

QString CannotSave(const QString& path, const QString& reason) {
    return QStringLiteral("The setup file \"%1\" cannot be saved: %2.").arg(path, reason);
}

QString CannotOpen(const QString& path, const QString& reason) {
    return QStringLiteral("The setup file \"%1\" cannot be opened: %2.").arg(path, reason);
}

// Writes the bytes and makes sure they are on disk before the rename makes them the file, or a
// power cut could leave an empty file in place of the old one. Returns why it failed, or "".
QString WriteToDisk(QSaveFile& file, const QByteArray& bytes) {
    if (file.write(bytes) != bytes.size() || !file.flush()) return file.errorString();
#ifdef Q_OS_UNIX
    if (::fsync(file.handle()) != 0) return qt_error_string(errno);
#endif
    return QString();
}

// Hands every pad's channel its wave file again, even an unchanged name, so an edited file is
// loaded afresh. The channels decode on their worker: the window does not wait, and a pad
// pressed before its sound is ready plays once it is.
QList<UnloadedPadWave> RearmPads(NoteSlotTable& table, WaveChannels& channels) {
    QList<UnloadedPadWave> unloaded;
    for (int pad = kFirstPad; pad <= kLastPad; ++pad) {
        WaveChannel& channel = channels.channel(pad);
        const QString& fileName = table[pad].WaveFileName;
        channel.load(QString());
        if (!fileName.isEmpty() && !channel.load(fileName)) {
            unloaded.append(UnloadedPadWave{pad, fileName, channel.lastError()});
        }
    }
    // A file saved while a pad sounded says so, but nothing plays now.
    for (int pad = kFirstPad; pad <= kLastPad; ++pad) table[pad].WavePlaying = BooleanText(false);
    return unloaded;
}

}  // namespace

SetupFileSaveResult SaveSetupFile(const NoteSlotTable& table, const QString& path) {
    const EncodedSetupFile encoded = EncodeSetupFile(table);
    if (!encoded.problem.isEmpty()) return {CannotSave(path, encoded.problem)};

    QSaveFile file(path);
    file.setDirectWriteFallback(false);
    if (!file.open(QIODevice::WriteOnly)) return {CannotSave(path, file.errorString())};
    const QString writeProblem = WriteToDisk(file, encoded.bytes);
    if (!writeProblem.isEmpty()) {
        file.cancelWriting();
        return {CannotSave(path, writeProblem)};
    }
    if (!file.commit()) return {CannotSave(path, file.errorString())};
    return {};
}

SetupFileOpenResult OpenSetupFile(Context& context, WaveChannels& channels, const QString& path) {
    // Only a plain file: opening a pipe would wait for a writer for ever, and a device or a folder
    // holds no setup.
    const QFileInfo info(path);
    if (info.exists() && !info.isFile()) {
        return {CannotOpen(path, info.isDir() ? QStringLiteral("it is a folder")
                                              : QStringLiteral("it is not a regular file")),
                {}};
    }
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) return {CannotOpen(path, file.errorString()), {}};
    // Nothing after the longest possible setup file can matter.
    const QByteArray bytes = file.read(std::min(file.size(), kLongestSetupFile));
    if (file.error() != QFileDevice::NoError) return {CannotOpen(path, file.errorString()), {}};
    file.close();

    DecodedSetupFile decoded = DecodeSetupFile(bytes);
    if (!decoded.table) return {CannotOpen(path, decoded.problem), {}};
    context.NoteSlots.swap(*decoded.table);
    return {QString(), RearmPads(context.NoteSlots, channels)};
}
