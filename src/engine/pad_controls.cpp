#include "engine/pad_controls.h"

#include "base/text_values.h"
#include "components/audio/playback/wave_channel.h"
#include "engine/gm_names.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"

#include <algorithm>

namespace {

constexpr int kNoteOn = 144;
constexpr int kNoteOff = 128;

struct LoopOption {
    bool looped;
    bool holdToPlay;
    bool toggleOnOff;
    const char* toolTip;
};

constexpr LoopOption kLoopOptions[] = {
    {false, false, false, "Play Wave Sound Once - Can retrigger"},
    {false, false, false, "Play Wave Sound Once - No retrigger"},
    {true, true, false, "Play Wave Sound Looped - Hold to play"},
    {true, false, true, "Play Wave Sound Looped - Toggle On/Off"},
};

const LoopOption* LoopOptionAt(int position) {
    if (position < 0 || position > 3) return nullptr;
    return &kLoopOptions[position];
}

}  // namespace

PadControls::PadControls(Context& context, WaveChannels& channels, InputDispatcher& dispatcher,
                         const GmNames& names, Display display)
    : context_(context),
      channels_(channels),
      dispatcher_(dispatcher),
      names_(names),
      display_(std::move(display)) {}

QString PadControls::LoopOptionToolTip(int position) {
    const LoopOption* option = LoopOptionAt(position);
    return option ? QString::fromLatin1(option->toolTip) : QString();
}

QString PadControls::CompileWaveInfo(int note) const {
    if (!IsSlot(note)) return QString();
    const QString& file = context_.NoteSlots[note].WaveFileName;
    return QStringLiteral("Wave Sound ") +
           (file.isEmpty() ? QStringLiteral("- no file selected") : file);
}

// Writes one stored field; a real change marks the arrangement as needing a save.
bool PadControls::SetField(QString& field, const QString& value) {
    if (field == value) return false;
    field = value;
    context_.FileChanged = true;
    return true;
}

void PadControls::ModeSelectorChanged(int note, int position) {
    if (!IsPad(note)) return;
    NoteSlot& slot = context_.NoteSlots[note];
    SetField(slot.NoteFunction, position != 0 ? QStringLiteral("1") : QStringLiteral("0"));
    QString description;
    if (position == 0) {
        // The slot's own number, even when a transpose has moved the note it sends.
        description = names_.GetMidiInfoText(note, slot);
    } else if (slot.WaveFileName.isEmpty()) {
        description = QStringLiteral("No sound file selected");
    } else {
        description = CompileWaveInfo(note);
    }
    SetField(slot.Description, description);
}

void PadControls::LoopOptionChanged(int note, int position) {
    if (!IsPad(note)) return;
    NoteSlot& slot = context_.NoteSlots[note];
    SetField(slot.WavePlayMode, NumberText(position));
    const LoopOption* option = LoopOptionAt(position);
    if (!option) return;
    SetField(slot.WaveLooped, BooleanText(option->looped));
    SetField(slot.WaveHoldToPlay, BooleanText(option->holdToPlay));
    SetField(slot.WaveToggleOnOff, BooleanText(option->toggleOnOff));
    channels_.channel(note).setLooping(option->looped);
}

void PadControls::VolumeChanged(int note, int value) {
    if (!IsPad(note)) return;
    value = std::clamp(value, kVolumeFloor, 0);
    channels_.channel(note).setVolume(value);
    SetField(context_.NoteSlots[note].WaveVolume, NumberText(value));
}

void PadControls::PanChanged(int note, int value) {
    if (!IsPad(note)) return;
    value = std::clamp(value, -kPanLimit, kPanLimit);
    channels_.channel(note).setPan(value);
    SetField(context_.NoteSlots[note].WavePan, NumberText(value));
}

void PadControls::FrequencyChanged(int note, int value) {
    if (!IsPad(note)) return;
    value = std::clamp(value, 0, kFrequencyCeiling);
    channels_.channel(note).setFrequency(value);
    SetField(context_.NoteSlots[note].WaveFrequency, NumberText(value));
}

PadView PadControls::ViewOf(int note) const {
    if (!IsSlot(note)) return {};
    const NoteSlot& slot = context_.NoteSlots[note];
    return {LenientNumber(slot.NoteFunction), LenientNumber(slot.WavePlayMode),
            LenientNumber(slot.WaveVolume), LenientNumber(slot.WavePan),
            LenientNumber(slot.WaveFrequency)};
}

void PadControls::KeyPressed(int note) {
    if (!IsPad(note)) return;
    if (display_.hideNoteMarker) display_.hideNoteMarker();
    // The key reports a press again while it is held; only the first one plays.
    if (heldKeyCount_ > 0 && heldKeys_[heldKeyCount_ - 1] == note) return;
    if (display_.showKey) display_.showKey(note, true);
    dispatcher_.ProcessInputData(kNoteOn, note, context_.DefaultMidiVelocity);
    heldKeys_[heldKeyCount_] = note;
    if (heldKeyCount_ != kHeldKeyLimit) ++heldKeyCount_;
    if (display_.hideNoteMarker) display_.hideNoteMarker();
}

// Every key the mouse went down on comes up, but only the key under the mouse is stopped.
void PadControls::KeyReleased(int note) {
    if (!IsPad(note)) return;
    for (int i = 0; i < heldKeyCount_; ++i) {
        if (display_.showKey) display_.showKey(heldKeys_[i], false);
    }
    heldKeyCount_ = 0;
    dispatcher_.ProcessInputData(kNoteOff, note, 0);
}

void PadControls::KeyHovered(int note) {
    if (!IsPad(note)) return;
    if (display_.showStatus) display_.showStatus(context_.NoteSlots[note].Description);
}

void PadControls::KeyClicked(int note) {
    if (!IsPad(note)) return;
    context_.CurrentSlot = note;
    if (display_.openNotePicker) display_.openNotePicker(note);
    NoteSlot& slot = context_.NoteSlots[note];
    if (slot.NoteFunction == QLatin1String("0")) {
        SetField(slot.Description,
                 names_.GetMidiInfoText(LenientNumber(slot.MidiNoteNumber), slot));
    }
    if (display_.placeNoteMarker) display_.placeNoteMarker(note);
}
