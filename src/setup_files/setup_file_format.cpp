#include "setup_files/setup_file_format.h"

#include "base/ansi_text.h"

#include <QtEndian>

namespace {

QString Place(int block, int slot) {
    return QStringLiteral("block %1 (%2), slot %3")
        .arg(block + 1)
        .arg(QLatin1String(kSetupFileBlocks[block].fieldName))
        .arg(slot);
}

// A value goes in UTF-8 when that fits. A longer one, such as a value read from a Windows file,
// goes back in Windows-1252 when that fits and reads back as the same text; else nothing fits.
std::optional<QByteArray> EncodeValue(const QString& value) {
    QByteArray utf8 = EncodeAnsiText(value);
    if (utf8.size() <= kLongestSetupValue) return utf8;
    std::optional<QByteArray> windows = EncodeWindows1252(value);
    if (windows && windows->size() <= kLongestSetupValue && DecodeAnsiText(*windows) == value)
        return windows;
    return std::nullopt;
}

DecodedSetupFile Broken(const QString& problem) {
    return DecodedSetupFile{std::nullopt, problem};
}

}  // namespace

EncodedSetupFile EncodeSetupFile(const NoteSlotTable& table) {
    EncodedSetupFile result;
    result.bytes.reserve(qsizetype(kSetupFileBlocks.size()) * kSlotCount * 8);
    for (int block = 0; block < int(kSetupFileBlocks.size()); ++block) {
        const auto field = kSetupFileBlocks[block].field;
        for (int slot = 0; slot < kSlotCount; ++slot) {
            const std::optional<QByteArray> text = EncodeValue(table[slot].*field);
            if (!text) {
                // A wrapped count would make the rest of the file unreadable.
                return EncodedSetupFile{
                    {},
                    QStringLiteral("the value in %1 is %2 bytes long, more than the %3 a "
                                   "setup file can hold")
                        .arg(Place(block, slot))
                        .arg(EncodeAnsiText(table[slot].*field).size())
                        .arg(kLongestSetupValue)};
            }
            char count[2];
            qToLittleEndian<qint16>(qint16(text->size()), count);
            result.bytes.append(count, 2).append(*text);
        }
    }
    return result;
}

DecodedSetupFile DecodeSetupFile(const QByteArray& bytes) {
    if (bytes.isEmpty()) return Broken(QStringLiteral("it is empty"));
    NoteSlotTable table;
    const char* const end = bytes.constData() + bytes.size();
    const char* next = bytes.constData();
    for (int block = 0; block < int(kSetupFileBlocks.size()); ++block) {
        const auto field = kSetupFileBlocks[block].field;
        // Most slots repeat their neighbour's value ("0", "False"); sharing it saves an allocation.
        QByteArrayView previousBytes;
        QString previousValue;
        for (int slot = 0; slot < kSlotCount; ++slot) {
            if (end - next < 2)
                return Broken(QStringLiteral("it ends early in ") + Place(block, slot));
            const qint16 count = qFromLittleEndian<qint16>(next);
            next += 2;
            if (count < 0) {
                return Broken(QStringLiteral("it holds a negative length (%1) in %2")
                                  .arg(count)
                                  .arg(Place(block, slot)));
            }
            if (end - next < count)
                return Broken(QStringLiteral("it ends early in ") + Place(block, slot));
            const QByteArrayView bytesOfValue(next, count);
            if (slot == 0 || bytesOfValue != previousBytes) {
                previousValue = DecodeAnsiText(QByteArray::fromRawData(next, count));
                previousBytes = bytesOfValue;
            }
            table[slot].*field = previousValue;
            next += count;
        }
    }
    return DecodedSetupFile{std::move(table), QString()};
}
