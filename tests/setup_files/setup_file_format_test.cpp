#include "setup_files/setup_file_format.h"

#include "setup_file_builders.h"

#include <gtest/gtest.h>

namespace {

// Reads the values back the plain way, one count and its text after another.
QList<QByteArray> SplitEntries(const QByteArray& bytes) {
    QList<QByteArray> values;
    qsizetype at = 0;
    while (at + 2 <= bytes.size()) {
        const qint16 count = qFromLittleEndian<qint16>(bytes.constData() + at);
        values.append(bytes.mid(at + 2, count));
        at += 2 + count;
    }
    return values;
}

TEST(SetupFileFormat, StoresTheFieldsBlockByBlockWithMidiPanLast) {
    const char* const blockOrder[21] = {
        "NoteFunction", "Description",  "MidiNoteNumber", "MidiChannel",     "MidiVelocity",
        "MidiPatch",    "MidiBank",     "WaveVolume",     "WavePan",         "WaveFrequency",
        "WaveLooped",   "WavePlayMode", "WaveHoldToPlay", "WaveToggleOnOff", "WaveFileName",
        "WaveAssigned", "WavePlaying",  "Reserved1",      "Reserved2",       "Reserved3",
        "MidiPan"};
    const EncodedSetupFile encoded = EncodeSetupFile(TaggedTable());
    ASSERT_TRUE(encoded.problem.isEmpty()) << encoded.problem.toStdString();

    const QList<QByteArray> values = SplitEntries(encoded.bytes);
    ASSERT_EQ(values.size(), 21 * 128);
    for (int block = 0; block < 21; ++block) {
        for (int slot = 0; slot < 128; ++slot) {
            ASSERT_EQ(values[block * 128 + slot],
                      QByteArray(blockOrder[block]) + ' ' + QByteArray::number(slot))
                << "block " << block + 1 << ", slot " << slot;
        }
    }
}

TEST(SetupFileFormat, CountsBytesOfUtf8AndReadsWindowsText) {
    NoteSlotTable table = FreshTable();
    table[0].NoteFunction = QStringLiteral("zoë");
    const QByteArray bytes = EncodeSetupFile(table).bytes;
    EXPECT_EQ(bytes.left(6), QByteArray("\x04\x00zo\xC3\xAB", 6));

    // A file made on Windows: one value in Windows-1252, another already in UTF-8.
    QByteArray windows = FileWithValue(15, 60, "C:\\Samples\\caf\xE9 \x80.wav");
    const qsizetype description = EmptyEntryOffset(2, 3);
    windows = windows.left(description) + Entry("Ce\xCC\x81lo \xC3\xA9t\xC3\xA9") +
              windows.mid(description + 2);
    const DecodedSetupFile decoded = DecodeSetupFile(windows);
    ASSERT_TRUE(decoded.table) << decoded.problem.toStdString();
    EXPECT_EQ((*decoded.table)[60].WaveFileName, QStringLiteral("C:\\Samples\\café €.wav"));
    EXPECT_EQ((*decoded.table)[3].Description, QStringLiteral("Ce\u0301lo été"));
}

TEST(SetupFileFormat, ValuesUpTo32767BytesFit) {
    NoteSlotTable table = FreshTable();
    table[60].WaveFileName = QString(32767, u'a');
    const EncodedSetupFile longest = EncodeSetupFile(table);
    ASSERT_TRUE(longest.problem.isEmpty());
    const DecodedSetupFile decoded = DecodeSetupFile(longest.bytes);
    ASSERT_TRUE(decoded.table);
    EXPECT_EQ((*decoded.table)[60].WaveFileName, table[60].WaveFileName);

    // 16384 characters, 32768 bytes, none in Windows-1252; and a text whose Windows-1252 bytes
    // would read back as other text in UTF-8.
    for (const QString& tooLong : {QString(16384, u'ā'), QStringLiteral("Ã©").repeated(12000)}) {
        table[60].WaveFileName = tooLong;
        EXPECT_FALSE(EncodeSetupFile(table).problem.isEmpty());
    }
}

}  // namespace
