#include "setup_files/setup_file.h"

#include "components/audio/playback/recording_wave_channels.h"
#include "setup_file_builders.h"

#include <gtest/gtest.h>

#include <QDir>
#include <QTemporaryDir>

#include <sys/resource.h>
#include <sys/stat.h>
#include <csignal>

namespace {

class SetupFileTest : public ::testing::Test {
  protected:
    QString pathOf(const char* name) const { return folder.filePath(QLatin1String(name)); }
    // Saves `table` into `name` and opens it again, as the File menu would.
    SetupFileOpenResult saveAndOpen(const NoteSlotTable& table, const char* name) {
        const SetupFileSaveResult saved = SaveSetupFile(table, pathOf(name));
        EXPECT_TRUE(saved.ok()) << saved.error;
        return OpenSetupFile(context, channels, pathOf(name));
    }

    QTemporaryDir folder;
    Context context;
    RecordingWaveChannels channels;
};

TEST_F(SetupFileTest, OpeningRestoresEveryFieldAndHandsEachPadItsWave) {
    NoteSlotTable table = TaggedTable();
    table[60].WaveFileName = QStringLiteral("/home/zoë/Musik/Glockenspiel ♪.wav");
    table[61].Description = QStringLiteral("Größe – 音色, \"quoted\"\r\nsecond line");
    table[62].WaveFileName = QString();
    table[5].Description = QStringLiteral("\uFEFFstarts with a byte-order mark");
    table[6].Reserved3 = QString(QChar(0)) + QStringLiteral("after a NUL");
    table[10].WavePlaying = QStringLiteral("True");
    table[60].WavePlaying = QStringLiteral("True");
    channels.channel(60).unloadableFiles << table[60].WaveFileName;
    const SetupFileOpenResult opened = saveAndOpen(table, "all.set");
    ASSERT_TRUE(opened.ok()) << opened.error;

    // Each pad lets its wave go and loads the one named, if any; one that fails is reported and
    // keeps its name for the next save. No pad is left playing.
    QStringList expectedLog;
    for (int pad = kFirstPad; pad <= kLastPad; ++pad) {
        expectedLog << QStringLiteral("%1 file ").arg(pad);
        if (pad != 62)
            expectedLog << QStringLiteral("%1 file %2").arg(pad).arg(table[pad].WaveFileName);
        table[pad].WavePlaying = QStringLiteral("False");
    }
    EXPECT_EQ(channels.log, expectedLog);
    ASSERT_EQ(opened.unloadedWaves.size(), 1);
    EXPECT_EQ(opened.unloadedWaves[0].pad, 60);
    EXPECT_EQ(opened.unloadedWaves[0].fileName, table[60].WaveFileName);
    for (int slot = 0; slot < kSlotCount; ++slot)
        EXPECT_TRUE(context.NoteSlots[slot] == table[slot]) << "slot " << slot;
}

TEST_F(SetupFileTest, BrokenFilesChangeNeitherTableNorChannels) {
    NoteSlotTable previous;
    previous[58].WaveFileName = QStringLiteral("/waves/previous.wav");
    ASSERT_TRUE(saveAndOpen(previous, "previous.set").ok());
    const NoteSlotTable tableBefore = context.NoteSlots;
    const QStringList logBefore = channels.log;

    const QByteArray emptyValues(kEmptyFileSize, '\0');
    const QByteArray withName = FileWithValue(15, 60, "/samples/kick.wav");
    QByteArray negative = emptyValues;
    negative.replace(EmptyEntryOffset(2, 5), 2, "\xFE\xFF");
    const struct {
        const char* name;
        QByteArray bytes;
        const char* problem;
    } cases[] = {
        {"empty", {}, "it is empty"},
        {"cut inside a count", emptyValues.left(EmptyEntryOffset(15, 60) + 1),
         "ends early in block 15 (WaveFileName), slot 60"},
        {"cut inside a text", withName.left(EmptyEntryOffset(15, 60) + 2 + 5),
         "ends early in block 15 (WaveFileName), slot 60"},
        {"one byte short", emptyValues.chopped(1), "ends early in block 21 (MidiPan), slot 127"},
        {"negative count", negative, "negative length (-2) in block 2 (Description), slot 5"},
    };
    for (const auto& broken : cases) {
        SCOPED_TRACE(broken.name);
        const QString path = pathOf(broken.name);
        ASSERT_TRUE(WriteFile(path, broken.bytes));
        const SetupFileOpenResult opened = OpenSetupFile(context, channels, path);
        EXPECT_TRUE(opened.error.contains(path)) << opened.error;
        EXPECT_TRUE(opened.error.contains(broken.problem)) << opened.error;
        EXPECT_TRUE(context.NoteSlots == tableBefore);
        EXPECT_EQ(channels.log, logBefore);
    }
    // A pipe would block the opening for ever.
    const QString pipe = pathOf("pipe.set");
    ASSERT_EQ(mkfifo(QFile::encodeName(pipe).constData(), 0600), 0);
    const std::pair<QString, QString> unopenable[] = {
        {pathOf("absent.set"), QString()},
        {folder.path(), QStringLiteral("it is a folder")},
        {pipe, QStringLiteral("it is not a regular file")},
        {QStringLiteral("/dev/zero"), QStringLiteral("it is not a regular file")}};
    for (const auto& [path, reason] : unopenable) {
        const SetupFileOpenResult opened = OpenSetupFile(context, channels, path);
        EXPECT_TRUE(opened.error.contains(path) && opened.error.contains(reason)) << opened.error;
        EXPECT_EQ(channels.log, logBefore);
    }
}

TEST_F(SetupFileTest, ALongWindowsValueSavesAndReopensUnchanged) {
    // 20000 bytes in Windows-1252 would be 40000 in UTF-8, more than a count can state. The bytes
    // after the last block are no part of it.
    const QString path = pathOf("windows.set");
    ASSERT_TRUE(
        WriteFile(path, FileWithValue(21, 127, QByteArray(20000, '\xE9')) + "trailing\xFF"));
    ASSERT_TRUE(OpenSetupFile(context, channels, path).ok());
    const SetupFileSaveResult saved = SaveSetupFile(context.NoteSlots, path);
    ASSERT_TRUE(saved.ok()) << saved.error;
    ASSERT_TRUE(OpenSetupFile(context, channels, path).ok());
    EXPECT_EQ(context.NoteSlots[127].MidiPan, QString(20000, u'é'));
}

TEST_F(SetupFileTest, FailedSaveLeavesTheOldFileAsItWasAndASavedOneReplacesItWhole) {
    const QString path = pathOf("kept.set");
    const QByteArray old = EncodeSetupFile(TaggedTable()).bytes;
    ASSERT_TRUE(WriteFile(path, old));

    NoteSlotTable tooLong;
    tooLong[60].WaveFileName = QString(32768, u'a');
    const SetupFileSaveResult refused = SaveSetupFile(tooLong, path);
    EXPECT_TRUE(refused.error.contains(path)) << refused.error;
    EXPECT_TRUE(refused.error.contains("block 15 (WaveFileName), slot 60"));
    EXPECT_EQ(ReadFile(path), old);

    // The disk fills up halfway through the new file.
    rlimit limit{};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &limit), 0);
    const rlimit saved = limit;
    limit.rlim_cur = 1024;
    const auto previousHandler = std::signal(SIGXFSZ, SIG_IGN);
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
    const SetupFileSaveResult full = SaveSetupFile(TaggedTable(), path);
    setrlimit(RLIMIT_FSIZE, &saved);
    std::signal(SIGXFSZ, previousHandler);
    EXPECT_TRUE(full.error.contains(path)) << full.error;
    EXPECT_EQ(ReadFile(path), old);
    EXPECT_EQ(QDir(folder.path()).entryList(QDir::Files), QStringList{QStringLiteral("kept.set")});

    const QString underAFile = path + QStringLiteral("/inside.set");
    EXPECT_TRUE(SaveSetupFile(NoteSlotTable{}, underAFile).error.contains(underAFile));
    EXPECT_EQ(ReadFile(path), old);

    // Saved at last, the shorter new file leaves nothing of the old one behind.
    ASSERT_TRUE(SaveSetupFile(NoteSlotTable{}, path).ok());
    EXPECT_EQ(ReadFile(path), QByteArray(kEmptyFileSize, '\0'));
}

}  // namespace
