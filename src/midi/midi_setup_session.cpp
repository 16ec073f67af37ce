#include "midi/midi_setup_session.h"

#include "components/midi/midi_port.h"
#include "components/settings/settings_store.h"
#include "engine/note_slots.h"
#include "engine/text_values.h"
#include "midi/midi_setup.h"

namespace {

const QString kMidiSection = QStringLiteral("MIDI");
constexpr ShortMessage kTestNoteOn{144, 60, 100};
constexpr ShortMessage kTestNoteOff{144, 60, 0};

int NameLengths(const QStringList& names) {
    int sum = 0;
    for (const QString& name : names) sum += static_cast<int>(name.size());
    return sum;
}

int Selection(const QStringList& names, int device) {
    if (names.isEmpty()) return -1;
    return device >= 0 && device < names.size() ? device : 0;
}

}  // namespace

MidiDeviceLists FillMidiDeviceLists(MidiSetup& midiSetup, Context& context) {
    MidiDeviceLists lists;
    lists.inNames = midiSetup.midiIn().deviceNames();
    lists.outNames = midiSetup.midiOut().deviceNames();
    context.MidiDeviceNamesLength = NameLengths(lists.inNames) + NameLengths(lists.outNames);
    lists.inSelection = Selection(lists.inNames, context.MidiInDevice);
    lists.outSelection = Selection(lists.outNames, context.MidiOutDevice);
    return lists;
}

MidiSetupSession::MidiSetupSession(Context& context, MidiSetup& midiSetup, SettingsStore& settings)
    : context_(context), midiSetup_(midiSetup), settings_(settings) {}

MidiSetupSession::~MidiSetupSession() {
    if (testNoteSounding_) EndTestNote();
}

MidiDeviceLists MidiSetupSession::Load() {
    midiSetup_.CheckMidiDevices();
    return FillMidiDeviceLists(midiSetup_, context_);
}

void MidiSetupSession::RememberOutputPort() {
    const MidiOutputPort& port = midiSetup_.midiOut();
    // By name: a JACK port list renumbers itself when other programs come and go.
    outDeviceBefore_ = port.isOpen() ? port.deviceNames().value(port.deviceIndex()) : QString();
}

void MidiSetupSession::StartTestNote(int outPosition) {
    MidiOutputPort& port = midiSetup_.midiOut();
    if (port.deviceCount() == 0) return;
    midiSetup_.CloseMidiOutPort();
    if (!port.open(outPosition)) return;
    port.send(kTestNoteOn);
    testNoteSounding_ = true;
}

void MidiSetupSession::EndTestNote() {
    MidiOutputPort& port = midiSetup_.midiOut();
    if (port.isOpen()) port.send(kTestNoteOff);
    midiSetup_.CloseMidiOutPort();
    testNoteSounding_ = false;
}

void MidiSetupSession::Accept(int inPosition, const QString& inName, int outPosition,
                              const QString& outName) {
    if (testNoteSounding_) EndTestNote();
    context_.MidiInDevice = inPosition;
    context_.MidiOutDevice = outPosition;
    settings_.setValue(kMidiSection, QStringLiteral("MIDI_Output"), NumberText(outPosition));
    settings_.setValue(kMidiSection, QStringLiteral("MIDI_Input"), NumberText(inPosition));
    settings_.setValue(kMidiSection, QStringLiteral("MIDI_OutputName"), outName);
    settings_.setValue(kMidiSection, QStringLiteral("MIDI_InputName"), inName);
    settings_.setValue(kMidiSection, QStringLiteral("MIDI_Error_Check"),
                       NumberText(context_.MidiDeviceNamesLength));
    midiSetup_.OpenMidiInPort();
    midiSetup_.OpenMidiOutPort();
}

void MidiSetupSession::Cancel() {
    if (testNoteSounding_) EndTestNote();
    if (outDeviceBefore_.isEmpty()) return;
    MidiOutputPort& port = midiSetup_.midiOut();
    const int device = static_cast<int>(port.deviceNames().indexOf(outDeviceBefore_));
    if (device < 0 || (port.isOpen() && port.deviceIndex() == device)) return;
    port.open(device);
}
