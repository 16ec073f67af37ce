#pragma once

#include "engine/note_slots.h"

#include <QList>
#include <QString>

class WaveChannels;

struct SetupFileSaveResult {
    QString error;  // "" when saved; else names the file and the reason, ready for a message box
    bool ok() const { return error.isEmpty(); }
};

// A pad whose wave file could not be loaded when a setup file was opened; its slot keeps the path.
struct UnloadedPadWave {
    int pad = 0;
    QString fileName;
    QString reason;  // the channel's own error text
};

struct SetupFileOpenResult {
    QString error;  // "" when the table was replaced; else names the file and what is wrong
    QList<UnloadedPadWave> unloadedWaves;
    bool ok() const { return error.isEmpty(); }
};

// Writes the table to `path`. An existing file is replaced as a whole, and only once the new one
// is completely on disk, so a failure or a power cut leaves the old file as it was.
SetupFileSaveResult SaveSetupFile(const NoteSlotTable& table, const QString& path);

// Reads the whole file into a new table, then swaps it into context.NoteSlots and hands each pad's
// channel its wave file again; the pads are left silent. A file that cannot be read completely
// changes nothing: neither the table nor any channel.
SetupFileOpenResult OpenSetupFile(Context& context, WaveChannels& channels, const QString& path);
