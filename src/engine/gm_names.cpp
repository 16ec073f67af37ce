#include "engine/gm_names.h"

#include "base/ansi_text.h"
#include "base/text_values.h"
#include "components/prompts/prompts.h"
#include "engine/note_slots.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace {

const char* const kPitchClasses[12] = {"C",     "C#/Db", "D",     "D#/Eb", "E",     "F",
                                       "F#/Gb", "G",     "G#/Ab", "A",     "A#/Bb", "B"};

// Line `number` of the file, or "" when the file is shorter.
QString LineOf(const QString& path, int number, bool* found) {
    const QStringList lines = ReadListFileLines(path, found);
    return number >= 0 && number < lines.size() ? lines[number] : QString();
}

}  // namespace

QStringList ReadListFileLines(const QString& path, bool* found) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        if (found) *found = false;
        return {};
    }
    if (found) *found = true;
    const QString text = DecodeAnsiText(file.readAll());
    QStringList lines = text.split(u'\n');
    // A final line end does not start another line.
    if (!lines.isEmpty() && lines.last().isEmpty()) lines.removeLast();
    for (QString& line : lines) {
        if (line.endsWith(u'\r')) line.chop(1);
    }
    return lines;
}

GmNames::GmNames(QString instrumentFile, QString drumFile, Prompts& prompts)
    : instrumentFile_(std::move(instrumentFile)),
      drumFile_(std::move(drumFile)),
      prompts_(&prompts) {}

QString GmNames::InstalledListFile(const QString& name) {
    const QString beside = QDir(QCoreApplication::applicationDirPath()).filePath(name);
    if (QFileInfo::exists(beside)) return beside;
    return QDir(QStringLiteral(OQ_DATA_INSTALL_DIR)).filePath(name);
}

GmNames GmNames::Installed(Prompts& prompts) {
    return GmNames(InstalledListFile(QStringLiteral("genmidi.txt")),
                   InstalledListFile(QStringLiteral("genmididrums.txt")), prompts);
}

QString GmNames::GetNoteName(int note) const {
    if (note < 0) {
        prompts_->message(Notice(QStringLiteral("Invalid MIDI Note"), PromptIcon::None));
        return QString();
    }
    return QStringLiteral("%1 %2 ").arg(QLatin1String(kPitchClasses[note % 12])).arg(note);
}

QString GmNames::GetInstrumentName(int program) const {
    bool found = false;
    const QString line = LineOf(instrumentFile_, program, &found);
    return found ? line : QStringLiteral("Instrument Number = %1").arg(program);
}

QString GmNames::GetDrumName(int key) const {
    return LineOf(drumFile_, key, nullptr);
}

QString GmNames::GetMidiInfoText(int note, const NoteSlot& slot) const {
    if (LenientNumber(slot.MidiChannel) == 9) {
        return QStringLiteral("MIDI Drum Note  ") + GetDrumName(note);
    }
    return QStringLiteral("MIDI Note ") + GetNoteName(note) + u' ' +
           GetInstrumentName(LenientNumber(slot.MidiPatch));
}

QString GmNames::GetInputLabel(int note) {
    if (note >= 49 && note <= 56) return QStringLiteral("Adaptive Input %1").arg(note - 48);
    if (IsPad(note)) return QStringLiteral("Note %1").arg(note - kFirstPad + 1);
    return QString();
}

GmNames::ListItems GmNames::LoadInstrumentList(bool reportMissing) const {
    return LoadList(instrumentFile_, QStringLiteral("MIDI Instrument info not found..."),
                    reportMissing);
}

GmNames::ListItems GmNames::LoadDrumList(bool reportMissing) const {
    return LoadList(drumFile_, QStringLiteral("MIDI Drum info not found..."), reportMissing);
}

GmNames::ListItems GmNames::LoadList(const QString& file, const QString& missingText,
                                     bool reportMissing) const {
    ListItems result;
    const QStringList lines = ReadListFileLines(file, &result.fileFound);
    if (!result.fileFound) {
        if (reportMissing) {
            prompts_->message(MessagePrompt{QStringLiteral("Please reinstall Orvelle Quindara"),
                                            missingText, PromptIcon::Information});
        }
        for (int k = 0; k < kSlotCount; ++k) result.items << QStringLiteral(" %1").arg(k);
        return result;
    }
    for (qsizetype k = 0; k < lines.size(); ++k) {
        result.items << QStringLiteral("  %1   ").arg(k) + lines[k];
    }
    return result;
}
