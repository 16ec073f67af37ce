#include "midi/midi_setup.h"

#include "components/midi/midi_port.h"
#include "engine/note_slots.h"

#include <algorithm>

namespace {

const QString kNoMidiInText = QStringLiteral("No avaliable Midi In Devices detected");
const QString kNoMidiOutText = QStringLiteral("No avaliable Midi Out Devices detected");

constexpr int kNoteOn = 144;
constexpr int kController = 176;
constexpr int kMainVolumeController = 7;
constexpr int kChannelCount = 16;

int NameLengths(const QStringList& names) {
    int sum = 0;
    for (const QString& name : names) sum += static_cast<int>(name.size());
    return sum;
}

}  // namespace

MidiSetup::MidiSetup(Context& context, MidiInputPort& midiIn, MidiOutputPort& midiOut,
                     StatusTextFunction showStatus, KeyDisplayFunction showKey)
    : context_(context),
      midiIn_(midiIn),
      midiOut_(midiOut),
      showStatus_(std::move(showStatus)),
      showKey_(std::move(showKey)) {}

void MidiSetup::UseMidiSystem(MidiSystem system) {
    system_ = system;
    CloseMidiInPort();
    CloseMidiOutPort();
    midiIn_.setMidiSystem(system);
    midiOut_.setMidiSystem(system);
}

void MidiSetup::CheckMidiDevices() {
    context_.MidiInAvailable = midiIn_.deviceCount() > 0;
    context_.MidiOutAvailable = midiOut_.deviceCount() > 0;
}

void MidiSetup::VerifyMidiDevices() {
    context_.MidiDeviceNamesLength +=
        NameLengths(midiIn_.deviceNames()) + NameLengths(midiOut_.deviceNames());
}

void MidiSetup::OpenMidiInPort() {
    if (midiIn_.deviceCount() == 0) {
        ShowStatus(kNoMidiInText);
        return;
    }
    if (midiIn_.isOpen()) midiIn_.close();
    if (midiIn_.open(context_.MidiInDevice)) {
        TakeBackStatus(kNoMidiInText);
    } else {
        ShowStatus(kNoMidiInText);
    }
}

void MidiSetup::OpenMidiOutPort() {
    if (midiOut_.deviceCount() == 0) {
        ShowStatus(kNoMidiOutText);
        return;
    }
    if (midiOut_.isOpen() || midiOut_.deviceIndex() == -1) midiOut_.close();
    if (midiOut_.open(context_.MidiOutDevice)) {
        TakeBackStatus(kNoMidiOutText);
    } else {
        ShowStatus(kNoMidiOutText);
    }
}

void MidiSetup::CloseMidiInPort() {
    if (midiIn_.isOpen()) midiIn_.close();
}

void MidiSetup::CloseMidiOutPort() {
    if (midiOut_.isOpen() || midiOut_.deviceIndex() == -1) midiOut_.close();
}

void MidiSetup::AllMidiNotesOff() {
    for (int channel = 0; channel < kChannelCount; ++channel) {
        for (int note = 0; note < kSlotCount; ++note) Send(kNoteOn + channel, note, 0);
    }
    if (!showKey_) return;
    for (int note = kFirstPad; note <= kLastPad; ++note) showKey_(note, false);
}

void MidiSetup::SetMidiMainVolume() {
    const int channel = context_.DefaultMidiChannel;
    // Another channel number would turn the controller into a different kind of message.
    if (channel < 0 || channel >= kChannelCount) return;
    Send(kController + channel, kMainVolumeController, context_.MidiMainVolume);
}

// Data bytes are clamped and a status that is not a byte is skipped, so a corrupt setting can
// never go out as some other message.
void MidiSetup::Send(int status, int data1, int data2) {
    if (status < 0 || status > 255) return;
    midiOut_.send({static_cast<std::uint8_t>(status),
                   static_cast<std::uint8_t>(std::clamp(data1, 0, 127)),
                   static_cast<std::uint8_t>(std::clamp(data2, 0, 127))});
}

void MidiSetup::ShowStatus(const QString& text) {
    shownStatus_ = text;
    if (showStatus_) showStatus_(text);
}

// The notice stays in the status bar: once its port opens it would tell the user something false.
void MidiSetup::TakeBackStatus(const QString& notice) {
    if (shownStatus_ == notice) ShowStatus(QString());
}
