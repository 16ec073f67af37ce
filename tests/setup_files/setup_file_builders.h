#pragma once

#include "setup_files/setup_file_format.h"

#include <QByteArray>
#include <QFile>
#include <QString>
#include <QtEndian>

// Tables and setup-file bytes made by hand for the setup-file tests.

// A file of 21 blocks of 128 empty values: nothing but their 16-bit counts.
inline constexpr int kEmptyFileSize = 21 * 128 * 2;

// Every field of every slot holds its own text, "WavePan 60" and so on, so that a value read
// into the wrong field or slot shows.
inline NoteSlotTable TaggedTable() {
    NoteSlotTable table;
    for (int k = 0; k < kSlotCount; ++k) {
        for (const SetupFileBlock& block : kSetupFileBlocks)
            table[k].*block.field = QStringLiteral("%1 %2").arg(block.fieldName).arg(k);
    }
    return table;
}

// One stored value: its 16-bit little-endian count, then the bytes.
inline QByteArray Entry(const QByteArray& text) {
    char word[2];
    qToLittleEndian<qint16>(qint16(text.size()), word);
    return QByteArray(word, 2) + text;
}

// Where the count of a value starts in a file whose earlier values are all empty.
// Blocks are numbered from 1, slots from 0.
inline qsizetype EmptyEntryOffset(int block, int slot) {
    return ((block - 1) * 128 + slot) * 2;
}

// A setup file of empty values but one: `text` in the given block and slot.
inline QByteArray FileWithValue(int block, int slot, const QByteArray& text) {
    QByteArray bytes(kEmptyFileSize, '\0');
    const qsizetype at = EmptyEntryOffset(block, slot);
    return bytes.left(at) + Entry(text) + bytes.mid(at + 2);
}

inline bool WriteFile(const QString& path, const QByteArray& bytes) {
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

inline QByteArray ReadFile(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}
