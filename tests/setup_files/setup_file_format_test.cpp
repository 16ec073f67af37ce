#include "setup_files/setup_file_format.h"

#include "setup_file_builders.h"

#include <gtest/gtest.h>

namespace {

TEST(SetupFileFormat, StoresTheFieldsBlockByBlockWithMidiPanLast) {
    QString NoteSlot::*const blockOrder[21] = {
        &NoteSlot::NoteFunction,   &NoteSlot::Description,     &NoteSlot::MidiNoteNumber,
        &NoteSlot::MidiChannel,    &NoteSlot::MidiVelocity,    &NoteSlot::MidiPatch,
        &NoteSlot::MidiBank,       &NoteSlot::WaveVolume,      &NoteSlot::WavePan,
        &NoteSlot::WaveFrequency,  &NoteSlot::WaveLooped,      &NoteSlot::WavePlayMode,
        &NoteSlot::WaveHoldToPlay, &NoteSlot::WaveToggleOnOff, &NoteSlot::WaveFileName,
        &NoteSlot::WaveAssigned,   &NoteSlot::WavePlaying,     &NoteSlot::Reserved1,
        &NoteSlot::Reserved2,      &NoteSlot::Reserved3,       &NoteSlot::MidiPan};
    // Block by block, each holding the field of all 128 slots, written and read alike.
    const NoteSlotTable table = TaggedTable();
    QByteArray bytes;
    for (QString NoteSlot::*field : blockOrder) {
        for (const NoteSlot& slot : table) bytes += Entry((slot.*field).toUtf8());
    }
    EXPECT_EQ(EncodeSetupFile(table).bytes, bytes);
    const DecodedSetupFile decoded = DecodeSetupFile(bytes);
    ASSERT_TRUE(decoded.table) << decoded.problem;
    EXPECT_TRUE(*decoded.table == table);
}

TEST(SetupFileFormat, CountsBytesOfUtf8AndReadsWindowsText) {
    NoteSlotTable table;
    table[0].NoteFunction = QStringLiteral("zoë");
    EXPECT_EQ(EncodeSetupFile(table).bytes.left(6), QByteArray("\x04\x00zo\xC3\xAB", 6));

    // A file made on Windows: one value in Windows-1252, another already in UTF-8.
    QByteArray windows = FileWithValue(15, 60, "C:\\Samples\\caf\xE9 \x80.wav");
    const qsizetype description = EmptyEntryOffset(2, 3);
    windows = windows.left(description) + Entry("Ce\xCC\x81lo \xC3\xA9t\xC3\xA9") +
              windows.mid(description + 2);
    const DecodedSetupFile decoded = DecodeSetupFile(windows);
    ASSERT_TRUE(decoded.table) << decoded.problem;
    EXPECT_EQ((*decoded.table)[60].WaveFileName, QStringLiteral("C:\\Samples\\café €.wav"));
    EXPECT_EQ((*decoded.table)[3].Description, QStringLiteral("Ce\u0301lo été"));
}

TEST(SetupFileFormat, ValuesUpTo32767BytesFit) {
    NoteSlotTable table;
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
