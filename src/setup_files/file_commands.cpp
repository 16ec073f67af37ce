#include "setup_files/file_commands.h"

#include "components/midi/midi_input_gate.h"
#include "components/prompts/prompts.h"
#include "components/settings/settings_store.h"
#include "engine/note_slots.h"
#include "setup_files/setup_file.h"

#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>
#include <QStorageInfo>

#include <algorithm>
#include <iterator>

namespace {

const QString kSetupFilter = QStringLiteral("Setup files (*.set) |*.set");
const QString kArrangeFilter = QStringLiteral("Arrange files (*.set) |*.set");
const QString kSaveChanges = QStringLiteral("Save changes to your file??");

// MIDI In plays again when the dialog closes, however it closes.
class MidiInQuietMeanwhile {
  public:
    explicit MidiInQuietMeanwhile(MidiInputGate& pump) : pump_(pump) { pump_.BeginDiscarding(); }
    ~MidiInQuietMeanwhile() { pump_.EndDiscarding(); }
    MidiInQuietMeanwhile(const MidiInQuietMeanwhile&) = delete;
    MidiInQuietMeanwhile& operator=(const MidiInQuietMeanwhile&) = delete;

  private:
    MidiInputGate& pump_;
};

// File systems whose folders hold no music and may not even list (reading /proc/kcore hangs).
bool IsSystemFileSystem(const QByteArray& type) {
    static const QByteArray kTypes[] = {"proc",    "sysfs",      "devtmpfs", "devpts",
                                        "debugfs", "tracefs",    "cgroup",   "cgroup2",
                                        "bpf",     "securityfs", "pstore",   "configfs"};
    return std::find(std::begin(kTypes), std::end(kTypes), type) != std::end(kTypes);
}

MessagePrompt Question(const QString& text, PromptButton defaultButton) {
    return MessagePrompt{kProgramTitle,
                         text,
                         PromptIcon::Question,
                         {PromptButton::Yes, PromptButton::No},
                         defaultButton};
}

}  // namespace

FileCommands::FileCommands(Context& context, WaveChannels& channels, const GmNames& names,
                           MidiInputGate& midiIn, Prompts& prompts, SettingsStore& settings,
                           Window window)
    : context_(context),
      channels_(channels),
      names_(names),
      midiIn_(midiIn),
      prompts_(prompts),
      settings_(settings),
      window_(std::move(window)) {}

QString FileCommands::TitleFor(const QString& path) {
    const QString name = path.isEmpty() ? QStringLiteral("Untitled") : QFileInfo(path).fileName();
    return QStringLiteral("Tarvik Radio - Orvelle Quindara - ") + name;
}

bool FileCommands::IsUsableFolder(const QString& folder) {
    const QFileInfo info(folder);
    if (folder.isEmpty() || !info.isDir() || !info.isReadable() || !info.isExecutable()) {
        return false;
    }
    return !IsSystemFileSystem(QStorageInfo(info.absoluteFilePath()).fileSystemType());
}

QString FileCommands::StartFolder() const {
    const QString last = settings_.value(QStringLiteral("Files"), QStringLiteral("LastFolder"));
    if (IsUsableFolder(last)) return last;
    const QString music = QStandardPaths::writableLocation(QStandardPaths::MusicLocation);
    if (IsUsableFolder(music)) return music;
    return QDir::homePath();
}

// Called only once a file was read or written there.
void FileCommands::RememberFolder(const QString& path) {
    settings_.setValue(QStringLiteral("Files"), QStringLiteral("LastFolder"),
                       QFileInfo(path).absolutePath());
}

QString FileCommands::OpenDialog(const FileDialogRequest& request) {
    MidiInQuietMeanwhile quiet(midiIn_);
    return prompts_.openFileName(request);
}

QString FileCommands::SaveDialog(const FileDialogRequest& request) {
    MidiInQuietMeanwhile quiet(midiIn_);
    return prompts_.saveFileName(request);
}

bool FileCommands::SaveChangesFirst() {
    if (!context_.FileChanged) return true;
    // Yes and No as always; Escape and the close box take back the command instead of
    // throwing the changes away.
    MessagePrompt question = Question(kSaveChanges, PromptButton::Yes);
    question.escapeButton = PromptButton::Cancel;
    switch (prompts_.message(question)) {
        case PromptButton::Yes:
            return Save();
        case PromptButton::No:
            return true;
        default:
            return false;
    }
}

void FileCommands::New() {
    if (!SaveChangesFirst()) return;
    InitializeAllMidiNotes(context_, names_, channels_);
    if (window_.updateUserControls) window_.updateUserControls();
    if (window_.setTitle) window_.setTitle(TitleFor(QString()));
    context_.CurrentFileName.clear();
    context_.GlobalTranspose = 0;
}

void FileCommands::Open() {
    if (!SaveChangesFirst()) return;
    const QString path = OpenDialog(
        FileDialogRequest{QStringLiteral("Open"), kSetupFilter, StartFolder(), QString()});
    if (path.isEmpty()) return;
    if (window_.showBusy) window_.showBusy(true);
    const SetupFileOpenResult result = OpenSetupFile(context_, channels_, path);
    if (window_.showBusy) window_.showBusy(false);
    if (!result.ok()) {
        prompts_.message(Notice(result.error, PromptIcon::Critical));
        return;
    }
    RememberFolder(path);
    context_.CurrentFileName = path;
    if (window_.updateUserControls) window_.updateUserControls();
    if (window_.setTitle) window_.setTitle(TitleFor(path));
    context_.FileChanged = false;
    QStringList missing;
    for (const UnloadedPadWave& wave : result.unloadedWaves) missing << wave.fileName;
    ReportMissingWaves(missing);
}

// All the pads' sounds that could not be found, in one message; the slots keep their paths.
void FileCommands::ReportMissingWaves(const QStringList& files) {
    if (files.isEmpty()) return;
    prompts_.message(Notice(
        QStringLiteral("These sound files could not be loaded; their pads stay silent:\n\n") +
            files.join(u'\n'),
        PromptIcon::Exclamation));
}

bool FileCommands::ConfirmReplace(const QString& path) {
    if (!QFileInfo::exists(path)) return true;
    return prompts_.message(
               Question(QStringLiteral("This file already exists. Replace existing file?"),
                        PromptButton::No)) == PromptButton::Yes;
}

// The old file is replaced only once the new one is complete, so nothing is deleted first.
bool FileCommands::WriteTo(const QString& path) {
    if (window_.showBusy) window_.showBusy(true);
    const SetupFileSaveResult result = SaveSetupFile(context_.NoteSlots, path);
    if (window_.showBusy) window_.showBusy(false);
    if (!result.ok()) {
        prompts_.message(Notice(result.error, PromptIcon::Critical));
        return false;
    }
    RememberFolder(path);
    context_.CurrentFileName = path;
    if (window_.setTitle) window_.setTitle(TitleFor(path));
    context_.FileChanged = false;
    return true;
}

namespace {

// A name typed without an extension gets the setup files' own.
QString WithSetExtension(const QString& path) {
    if (path.isEmpty() || !QFileInfo(path).suffix().isEmpty()) return path;
    return path + QStringLiteral(".set");
}

}  // namespace

bool FileCommands::Save() {
    QString path = context_.CurrentFileName;
    if (path.isEmpty()) {
        path = WithSetExtension(SaveDialog(
            FileDialogRequest{QStringLiteral("Save"), kArrangeFilter, StartFolder(), QString()}));
        if (path.isEmpty() || !ConfirmReplace(path)) return false;
    }
    return WriteTo(path);
}

bool FileCommands::SaveAs() {
    const QString path = WithSetExtension(SaveDialog(FileDialogRequest{
        QStringLiteral("Save As"), kSetupFilter, StartFolder(), context_.CurrentFileName}));
    if (path.isEmpty() || !ConfirmReplace(path)) return false;
    return WriteTo(path);
}

bool FileCommands::AnyRecordedMaterialUnsaved() const {
    return std::any_of(context_.RecordingUnsaved.begin(), context_.RecordingUnsaved.end(),
                       [](bool unsaved) { return unsaved; });
}

void FileCommands::Exit() {
    if (context_.Recording || context_.Playing) return;
    if (AnyRecordedMaterialUnsaved()) {
        prompts_.message(Notice(QStringLiteral("Please save or trash any recorded material"),
                                PromptIcon::Critical));
        return;
    }
    if (window_.close) window_.close();
}

bool FileCommands::CloseAllowed() {
    const bool busy = context_.Recording || context_.Playing;
    // The arrangement: a cancelled question or a save that did not happen (dialog cancelled,
    // replace refused, write failed) keeps the window open.
    if (!busy && !SaveChangesFirst()) return false;
    // The takes: never while one records or plays; unsaved ones are offered a last chance.
    if (busy) return false;
    if (AnyRecordedMaterialUnsaved()) {
        const MessagePrompt question = Question(
            QStringLiteral("Do yo want to save any recorded material?"), PromptButton::Yes);
        if (prompts_.message(question) == PromptButton::Yes) return false;
    }
    return true;
}
