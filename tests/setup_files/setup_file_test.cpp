#include "setup_files/setup_file.h"

#include "setup_files/setup_file_format.h"

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
    QString pathOf(const QString& name) const { return folder.filePath(name); }

    // Opens `table` from a file, as the File menu would.
    void openTable(const NoteSlotTable& table) {
        const QString path = pathOf(QStringLiteral("previous.set"));
        ASSERT_TRUE(SaveSetupFile(table, path).ok());
        ASSERT_TRUE(OpenSetupFile(context, channels, path).ok());
    }

    QTemporaryDir folder;
    Context context;
    RecordingWaveChannels channels;
};

TEST_F(SetupFileTest, FreshTableSavesToExactBytesOverALongerFile) {
    const NoteSlotTable table = FreshTable();
    const QString path = pathOf(QStringLiteral("fresh.set"));
    ASSERT_TRUE(WriteFile(path, QByteArray(20000, 'x')));

    const SetupFileSaveResult saved = SaveSetupFile(table, path);
    ASSERT_TRUE(saved.ok()) << saved.error.toStdString();

    const QByteArray bytes = ReadFile(path);
    qsizetype valueBytes = 0;
    for (const NoteSlot& slot : table) {
        for (const SetupFileBlock& block : kSetupFileBlocks)
            valueBytes += (slot.*block.field).toUtf8().size();
    }
    EXPECT_EQ(bytes.size(), kEmptyFileSize + valueBytes);
    EXPECT_EQ(bytes.left(384), QByteArray("\x01\x00\x30", 3).repeated(128));
    EXPECT_EQ(bytes.right(512), QByteArray("\x02\x00\x36\x33", 4).repeated(128));
    // Empty file names are bare counts 00 00, between WaveToggleOnOff and WaveAssigned.
    const QByteArray allFalse = Entry("False").repeated(128);
    EXPECT_TRUE(bytes.contains(allFalse + QByteArray(256, '\0') + allFalse));
}

TEST_F(SetupFileTest, OpeningRestoresEveryFieldButThePadsPlayingState) {
    NoteSlotTable table = TaggedTable();
    table[60].WaveFileName = QStringLiteral("/home/zoë/Musik/Glockenspiel ♪.wav");
    table[61].Description = QStringLiteral("Größe – 音色, \"quoted\"\r\nsecond line");
    table[62].Reserved1 = QString();
    table[5].Description = QStringLiteral("\uFEFFstarts with a byte-order mark");
    table[6].Reserved3 = QString(QChar(0)) + QStringLiteral("after a NUL");
    table[10].WavePlaying = QStringLiteral("True");
    table[60].WavePlaying = QStringLiteral("True");
    openTable(table);

    for (int pad = kFirstPad; pad <= kLastPad; ++pad)
        table[pad].WavePlaying = QStringLiteral("False");
    for (int slot = 0; slot < kSlotCount; ++slot) {
        for (const SetupFileBlock& block : kSetupFileBlocks) {
            EXPECT_EQ(context.NoteSlots[slot].*block.field, table[slot].*block.field)
                << block.fieldName << " of slot " << slot;
        }
    }
}

TEST_F(SetupFileTest, OpeningHandsEachPadItsWaveAndReportsTheOnesThatFail) {
    NoteSlotTable table = FreshTable();
    const QMap<int, QString> padFiles{{57, QStringLiteral("/waves/a.wav")},
                                      {60, QStringLiteral("/gone/missing.wav")},
                                      {72, QStringLiteral("/waves/z.wav")}};
    for (auto it = padFiles.begin(); it != padFiles.end(); ++it) {
        table[it.key()].WaveFileName = it.value();
        table[it.key()].WavePlaying = QStringLiteral("True");
    }
    table[10].WaveFileName = QStringLiteral("/waves/ten.wav");
    table[10].WavePlaying = QStringLiteral("True");
    const QString path = pathOf(QStringLiteral("pads.set"));
    ASSERT_TRUE(SaveSetupFile(table, path).ok());
    channels.channel(60).unloadableFiles << QStringLiteral("/gone/missing.wav");

    const SetupFileOpenResult opened = OpenSetupFile(context, channels, path);

    ASSERT_TRUE(opened.ok()) << opened.error.toStdString();
    QStringList expectedLog;
    for (int pad = kFirstPad; pad <= kLastPad; ++pad) {
        expectedLog << QStringLiteral("%1 file ").arg(pad);
        if (padFiles.contains(pad))
            expectedLog << QStringLiteral("%1 file %2").arg(pad).arg(padFiles[pad]);
    }
    EXPECT_EQ(channels.log, expectedLog);
    ASSERT_EQ(opened.unloadedWaves.size(), 1);
    EXPECT_EQ(opened.unloadedWaves[0].pad, 60);
    EXPECT_EQ(opened.unloadedWaves[0].fileName, QStringLiteral("/gone/missing.wav"));
    EXPECT_EQ(opened.unloadedWaves[0].reason, QStringLiteral("cannot open /gone/missing.wav"));

    EXPECT_EQ(context.NoteSlots[60].WaveFileName, QStringLiteral("/gone/missing.wav"));
    EXPECT_EQ(channels.channel(57).fileName(), QStringLiteral("/waves/a.wav"));
    EXPECT_EQ(context.NoteSlots[10].WaveFileName, QStringLiteral("/waves/ten.wav"));
    EXPECT_EQ(context.NoteSlots[10].WavePlaying, QStringLiteral("True"));
    for (int pad : padFiles.keys())
        EXPECT_EQ(context.NoteSlots[pad].WavePlaying, QStringLiteral("False"));
}

TEST_F(SetupFileTest, BrokenFilesChangeNeitherTableNorChannels) {
    NoteSlotTable previous = FreshTable();
    previous[58].WaveFileName = QStringLiteral("/waves/previous.wav");
    openTable(previous);
    const NoteSlotTable tableBefore = context.NoteSlots;
    const QStringList logBefore = channels.log;

    const QByteArray emptyValues(kEmptyFileSize, '\0');
    const QByteArray withName = FileWithValue(15, 60, "/samples/kick.wav");
    QByteArray negative = emptyValues;
    negative.replace(EmptyEntryOffset(2, 5), 2, "\xFE\xFF");
    struct Case {
        const char* name;
        QByteArray bytes;
        const char* problem;
    };
    const Case cases[] = {
        {"empty", {}, "it is empty"},
        {"cut inside a count", emptyValues.left(EmptyEntryOffset(15, 60) + 1),
         "ends early in block 15 (WaveFileName), slot 60"},
        {"cut inside a text", withName.left(EmptyEntryOffset(15, 60) + 2 + 5),
         "ends early in block 15 (WaveFileName), slot 60"},
        {"one byte short", emptyValues.chopped(1), "ends early in block 21 (MidiPan), slot 127"},
        {"negative count", negative, "negative length (-2) in block 2 (Description), slot 5"},
        {"not a setup file", QByteArray(2000, '\xFF'), "negative length"},
        {"text file", QByteArray("[Settings]\nvolume=10\n").repeated(50),
         "ends early in block 1 (NoteFunction), slot 0"},
    };
    for (const Case& broken : cases) {
        SCOPED_TRACE(broken.name);
        const QString path = pathOf(QStringLiteral("%1.set").arg(broken.name));
        ASSERT_TRUE(WriteFile(path, broken.bytes));
        const SetupFileOpenResult opened = OpenSetupFile(context, channels, path);
        EXPECT_TRUE(opened.error.contains(path)) << opened.error.toStdString();
        EXPECT_TRUE(opened.error.contains(broken.problem)) << opened.error.toStdString();
        EXPECT_TRUE(context.NoteSlots == tableBefore);
        EXPECT_EQ(channels.log, logBefore);
    }
    // A pipe would block the opening for ever.
    const QString pipe = pathOf(QStringLiteral("pipe.set"));
    ASSERT_EQ(mkfifo(QFile::encodeName(pipe).constData(), 0600), 0);
    const std::pair<QString, QString> unopenable[] = {
        {pathOf(QStringLiteral("absent.set")), QString()},
        {folder.path(), QStringLiteral("it is a folder")},
        {pipe, QStringLiteral("it is not a regular file")},
        {QStringLiteral("/dev/zero"), QStringLiteral("it is not a regular file")}};
    for (const auto& [path, reason] : unopenable) {
        const SetupFileOpenResult opened = OpenSetupFile(context, channels, path);
        EXPECT_TRUE(opened.error.contains(path) && opened.error.contains(reason))
            << opened.error.toStdString();
        EXPECT_EQ(channels.log, logBefore);
    }
}

TEST_F(SetupFileTest, ALongWindowsValueSavesAndReopensUnchanged) {
    // 20000 bytes in Windows-1252 would be 40000 in UTF-8, more than a count can state. The bytes
    // after the last block are no part of it.
    const QString path = pathOf(QStringLiteral("windows.set"));
    ASSERT_TRUE(
        WriteFile(path, FileWithValue(21, 127, QByteArray(20000, '\xE9')) + "trailing\xFF"));
    ASSERT_TRUE(OpenSetupFile(context, channels, path).ok());
    const SetupFileSaveResult saved = SaveSetupFile(context.NoteSlots, path);
    ASSERT_TRUE(saved.ok()) << saved.error.toStdString();
    ASSERT_TRUE(OpenSetupFile(context, channels, path).ok());
    EXPECT_EQ(context.NoteSlots[127].MidiPan, QString(20000, u'é'));
}

TEST_F(SetupFileTest, FailedSaveLeavesTheOldFileAsItWas) {
    const QString path = pathOf(QStringLiteral("kept.set"));
    const QByteArray old = EncodeSetupFile(TaggedTable()).bytes;
    ASSERT_TRUE(WriteFile(path, old));

    NoteSlotTable tooLong = FreshTable();
    tooLong[60].WaveFileName = QString(32768, u'a');
    const SetupFileSaveResult refused = SaveSetupFile(tooLong, path);
    EXPECT_TRUE(refused.error.contains(path)) << refused.error.toStdString();
    EXPECT_TRUE(refused.error.contains("block 15 (WaveFileName), slot 60"));
    EXPECT_EQ(ReadFile(path), old);

    // The disk fills up halfway through the new file.
    rlimit limit{};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &limit), 0);
    const rlimit saved = limit;
    limit.rlim_cur = 1024;
    const auto previousHandler = std::signal(SIGXFSZ, SIG_IGN);
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
    const SetupFileSaveResult full = SaveSetupFile(FreshTable(), path);
    setrlimit(RLIMIT_FSIZE, &saved);
    std::signal(SIGXFSZ, previousHandler);
    EXPECT_FALSE(full.ok());
    EXPECT_TRUE(full.error.contains(path)) << full.error.toStdString();
    EXPECT_EQ(ReadFile(path), old);
    EXPECT_EQ(QDir(folder.path()).entryList(QDir::Files), QStringList{QStringLiteral("kept.set")});

    const QString underAFile = path + QStringLiteral("/inside.set");
    const SetupFileSaveResult unwritable = SaveSetupFile(FreshTable(), underAFile);
    EXPECT_TRUE(unwritable.error.contains(underAFile)) << unwritable.error.toStdString();
    EXPECT_EQ(ReadFile(path), old);
}

}  // namespace
