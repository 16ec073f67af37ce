#pragma once

#include <QString>
#include <QStringList>

#include <optional>

class GmNames;
struct Context;
struct NoteSlot;

// The Settings menu's global MIDI transpose and velocity commands: each moves the outgoing note
// or velocity of all 128 slots by one step.
class GlobalMidiCommands {
  public:
    struct Shown {             // what the window shows for one second after a command
        QStringList labels;    // 16 captions for pads 57..72
        bool green = false;    // false = yellow (transpose), true = green (velocity)
        bool infoBar = false;  // the transpose info bar is (re)shown
    };

    static constexpr int kTransposeLimit = 50;

    GlobalMidiCommands(Context& context, const GmNames& names) : context_(context), names_(names) {}

    // nullopt: refused at the bound; nothing changes and nothing is shown.
    std::optional<Shown> TransposeDown();
    std::optional<Shown> TransposeUp();
    Shown VelocityDown();
    Shown VelocityUp();
    QString TransposeInfoText() const;  // "MIDI Transpose = -3"

  private:
    void TransposeAll(int step);
    void ChangeAllVelocities(int step);
    void SetField(QString& field, const QString& value);
    QStringList PadLabels(QString NoteSlot::*field) const;

    Context& context_;
    const GmNames& names_;
};
