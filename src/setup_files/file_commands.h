#pragma once

#include "components/prompts/prompts.h"

#include <QString>

#include <functional>

class GmNames;
class MidiInputGate;
class SettingsStore;
class WaveChannels;
struct Context;

// The File menu: New, Open, Save, Save As and Exit, the unsaved-changes prompts, the window
// title and the checks before the window closes. While a file dialog is open MIDI In plays
// nothing: its messages are dropped, but the port and the connections made to it stay.
class FileCommands {
  public:
    // What the commands need from the window.
    struct Window {
        std::function<void()> updateUserControls;
        std::function<void(const QString&)> setTitle;
        std::function<void(bool busy)> showBusy;
        std::function<void()> close;  // asks the window to close, which runs the checks below
    };

    FileCommands(Context& context, WaveChannels& channels, const GmNames& names,
                 MidiInputGate& midiIn, Prompts& prompts, SettingsStore& settings, Window window);

    static QString TitleFor(const QString& path);  // "" gives the untitled caption

    void New();
    void Open();
    // True when the arrangement was written.
    bool Save();
    bool SaveAs();
    void Exit();

    // The two checks when the window is about to close, in their order; true lets it close.
    bool CloseAllowed();
    bool AnyRecordedMaterialUnsaved() const;

    // Where the next file dialog starts: the last folder used, else the music folder or home.
    QString StartFolder() const;

    // A folder a file dialog may start in: one the user can list, on a disk, not /proc or /sys.
    static bool IsUsableFolder(const QString& folder);

  private:
    // Offers to save unsaved changes. False when the command must stop: the question was
    // cancelled (Escape, the close box) or the save it asked for did not happen.
    bool SaveChangesFirst();
    bool WriteTo(const QString& path);
    bool ConfirmReplace(const QString& path);
    void RememberFolder(const QString& path);
    QString OpenDialog(const FileDialogRequest& request);
    QString SaveDialog(const FileDialogRequest& request);
    void ReportMissingWaves(const QStringList& files);

    Context& context_;
    WaveChannels& channels_;
    const GmNames& names_;
    MidiInputGate& midiIn_;
    Prompts& prompts_;
    SettingsStore& settings_;
    Window window_;
};
