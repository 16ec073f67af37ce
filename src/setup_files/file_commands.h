#pragma once

#include <QString>

#include <functional>

class GmNames;
class MidiSetup;
class Prompts;
class SettingsStore;
class WaveChannels;
struct Context;

// The File menu: New, Open, Save, Save As and Exit, the unsaved-changes prompts, the window
// title and the checks before the window closes. The MIDI input port is closed while a file
// dialog is open, so no note arrives meanwhile, and reopened on every way out.
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
                 MidiSetup& midiSetup, Prompts& prompts, SettingsStore& settings, Window window);

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

  private:
    void SavePrompt();
    bool AskToSaveChanges();
    bool WriteTo(const QString& path);
    bool ConfirmReplace(const QString& path);
    void RememberFolder(const QString& path);
    void ReportMissingWaves(const QStringList& files);

    Context& context_;
    WaveChannels& channels_;
    const GmNames& names_;
    MidiSetup& midiSetup_;
    Prompts& prompts_;
    SettingsStore& settings_;
    Window window_;
};
