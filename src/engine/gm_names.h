#pragma once

#include <QString>
#include <QStringList>

class Prompts;
struct NoteSlot;

// Names of pitches, General MIDI programs and drum keys, and the one-line MIDI description of a
// slot. Program and drum names come from two list files, one name per line, line k naming
// number k; they are read afresh on every lookup, so an edited file shows at once.
class GmNames {
  public:
    GmNames(QString instrumentFile, QString drumFile, Prompts& prompts);

    // The list files shipped with the program: beside the executable, else in the shared data
    // folder.
    static QString InstalledListFile(const QString& name);
    static GmNames Installed(Prompts& prompts);

    // "C 60 ": pitch class, the number and a blank. A negative note is reported and gives "".
    QString GetNoteName(int note) const;
    // Line `program` of the instrument list, "Instrument Number = n" without the file, "" past its
    // end.
    QString GetInstrumentName(int program) const;
    // Line `key` of the drum list; "" without the file or past its end.
    QString GetDrumName(int key) const;
    // "MIDI Note C 60  Acoustic Grand Piano", or "MIDI Drum Note  Bass Drum 1" on channel 9.
    QString GetMidiInfoText(int note, const NoteSlot& slot) const;
    // "Adaptive Input 1".."8" for notes 49..56, "Note 1".."16" for the pads, else "".
    static QString GetInputLabel(int note);

    // The items of the pickers' lists: "  k   name" for every line of the file. A missing file
    // gives the numbers " 0" to " 127" and, when asked, the message that it was not found.
    struct ListItems {
        QStringList items;
        bool fileFound = true;
    };
    ListItems LoadInstrumentList(bool reportMissing) const;
    ListItems LoadDrumList(bool reportMissing) const;

    const QString& instrumentFile() const { return instrumentFile_; }
    const QString& drumFile() const { return drumFile_; }

  private:
    ListItems LoadList(const QString& file, const QString& missingText, bool reportMissing) const;

    QString instrumentFile_;
    QString drumFile_;
    Prompts* prompts_;
};

// The lines of a list file without their line ends, decoded as UTF-8 or, failing that,
// Windows-1252. *found (when given) tells whether the file could be read.
QStringList ReadListFileLines(const QString& path, bool* found);
