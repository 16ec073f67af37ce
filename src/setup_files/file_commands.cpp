#include "setup_files/file_commands.h"

#include "components/prompts/prompts.h"
#include "components/settings/settings_store.h"
#include "engine/note_slots.h"
#include "midi/midi_setup.h"
#include "setup_files/setup_file.h"

#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>

#include <algorithm>

namespace {

const QString kSetupFilter = QStringLiteral("Setup files (*.set) |*.set");
const QString kArrangeFilter = QStringLiteral("Arrange files (*.set) |*.set");
const QString kSaveChanges = QStringLiteral("Save changes to your file??");

// Reopens the MIDI input port when the command ends, however it ends.
class MidiInClosedMeanwhile {
  public:
    explicit MidiInClosedMeanwhile(MidiSetup& midi) : midi_(midi) { midi_.CloseMidiInPort(); }
    ~MidiInClosedMeanwhile() { midi_.OpenMidiInPort(); }
    MidiInClosedMeanwhile(const MidiInClosedMeanwhile&) = delete;
    MidiInClosedMeanwhile& operator=(const MidiInClosedMeanwhile&) = delete;

  private:
    MidiSetup& midi_;
};

MessagePrompt Question(const QString& text, PromptButton defaultButton) {
    return MessagePrompt{kProgramTitle,
                         text,
                         PromptIcon::Question,
                         {PromptButton::Yes, PromptButton::No},
                         defaultButton};
}

}  // namespace

FileCommands::FileCommands(Context& context, WaveChannels& channels, const GmNames& names,
                           MidiSetup& midiSetup, Prompts& prompts, SettingsStore& settings,
                           Window window)
    : context_(context),
      channels_(channels),
      names_(names),
      midiSetup_(midiSetup),
      prompts_(prompts),
      settings_(settings),
      window_(std::move(window)) {}

QString FileCommands::TitleFor(const QString& path) {
    const QString name = path.isEmpty() ? QStringLiteral("Untitled") : QFileInfo(path).fileName();
    return QStringLiteral("Tarvik Radio - Orvelle Quindara - ") + name;
}

QString FileCommands::StartFolder() const {
    const QString last = settings_.value(QStringLiteral("Files"), QStringLiteral("LastFolder"));
    if (!last.isEmpty() && QFileInfo(last).isDir()) return last;
    const QString music = QStandardPaths::writableLocation(QStandardPaths::MusicLocation);
    if (!music.isEmpty() && QFileInfo(music).isDir()) return music;
    return QDir::homePath();
}

void FileCommands::RememberFolder(const QString& path) {
    settings_.setValue(QStringLiteral("Files"), QStringLiteral("LastFolder"),
                       QFileInfo(path).absolutePath());
}

bool FileCommands::AskToSaveChanges() {
    return prompts_.message(Question(kSaveChanges, PromptButton::Yes)) == PromptButton::Yes;
}

void FileCommands::SavePrompt() {
    if (context_.FileChanged && AskToSaveChanges()) Save();
}

void FileCommands::New() {
    SavePrompt();
    InitializeAllMidiNotes(context_, names_, channels_);
    if (window_.updateUserControls) window_.updateUserControls();
    if (window_.setTitle) window_.setTitle(TitleFor(QString()));
    context_.CurrentFileName.clear();
    context_.GlobalTranspose = 0;
}

void FileCommands::Open() {
    SavePrompt();
    QStringList missing;
    {
        MidiInClosedMeanwhile quiet(midiSetup_);
        const QString path = prompts_.openFileName(
            FileDialogRequest{QStringLiteral("Open"), kSetupFilter, StartFolder(), QString()});
        if (path.isEmpty()) return;
        RememberFolder(path);
        if (window_.showBusy) window_.showBusy(true);
        const SetupFileOpenResult result = OpenSetupFile(context_, channels_, path);
        if (window_.showBusy) window_.showBusy(false);
        if (!result.ok()) {
            prompts_.message(Notice(result.error, PromptIcon::Critical));
            return;
        }
        context_.CurrentFileName = path;
        if (window_.updateUserControls) window_.updateUserControls();
        if (window_.setTitle) window_.setTitle(TitleFor(path));
        context_.FileChanged = false;
        for (const UnloadedPadWave& wave : result.unloadedWaves) missing << wave.fileName;
    }
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
    MidiInClosedMeanwhile quiet(midiSetup_);
    QString path = context_.CurrentFileName;
    if (path.isEmpty()) {
        path = WithSetExtension(prompts_.saveFileName(
            FileDialogRequest{QStringLiteral("Save"), kArrangeFilter, StartFolder(), QString()}));
        if (path.isEmpty()) return false;
        RememberFolder(path);
        if (!ConfirmReplace(path)) return false;
    }
    return WriteTo(path);
}

bool FileCommands::SaveAs() {
    MidiInClosedMeanwhile quiet(midiSetup_);
    const QString path = WithSetExtension(prompts_.saveFileName(FileDialogRequest{
        QStringLiteral("Save As"), kSetupFilter, StartFolder(), context_.CurrentFileName}));
    if (path.isEmpty()) return false;
    RememberFolder(path);
    if (!ConfirmReplace(path)) return false;
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
    // The arrangement: a save that did not happen (dialog cancelled, replace refused) keeps
    // the window open.
    if (!busy && context_.FileChanged && AskToSaveChanges()) {
        Save();
        if (context_.FileChanged) return false;
    }
    // The takes: never while one records or plays; unsaved ones are offered a last chance.
    if (busy) return false;
    if (AnyRecordedMaterialUnsaved()) {
        const MessagePrompt question = Question(
            QStringLiteral("Do yo want to save any recorded material?"), PromptButton::Yes);
        if (prompts_.message(question) == PromptButton::Yes) return false;
    }
    return true;
}
