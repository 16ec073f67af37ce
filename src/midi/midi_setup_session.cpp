#include "midi/midi_setup_session.h"

#include "base/text_values.h"
#include "components/midi/midi_port.h"
#include "components/settings/settings_store.h"
#include "engine/note_slots.h"
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

// By name: a JACK port list renumbers itself when other programs come and go.
template <class Port>
QString OpenDeviceName(const Port& port) {
    return port.isOpen() ? port.deviceNames().value(port.deviceIndex()) : QString();
}

template <class Port>
void OpenAgain(Port& port, const QString& deviceName) {
    if (deviceName.isEmpty()) return;
    const int device = static_cast<int>(port.deviceNames().indexOf(deviceName));
    if (device < 0 || (port.isOpen() && port.deviceIndex() == device)) return;
    port.open(device);
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

void MidiSetupSession::RememberPorts() {
    systemBefore_ = midiSetup_.midiSystem();
    inDeviceBefore_ = OpenDeviceName(midiSetup_.midiIn());
    outDeviceBefore_ = OpenDeviceName(midiSetup_.midiOut());
}

MidiSystem MidiSetupSession::midiSystem() const {
    return midiSetup_.midiSystem();
}

MidiDeviceLists MidiSetupSession::ChangeSystem(MidiSystem system) {
    if (testNoteSounding_) EndTestNote();
    midiSetup_.UseMidiSystem(system);
    return Load();
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
    settings_.setValue(kMidiSection, kMidiSystemKey, MidiSystemText(midiSetup_.midiSystem()));
    midiSetup_.OpenMidiInPort();
    midiSetup_.OpenMidiOutPort();
}

void MidiSetupSession::Cancel() {
    if (testNoteSounding_) EndTestNote();
    if (midiSetup_.midiSystem() != systemBefore_) {
        midiSetup_.UseMidiSystem(systemBefore_);
        midiSetup_.CheckMidiDevices();
        OpenAgain(midiSetup_.midiIn(), inDeviceBefore_);
    }
    OpenAgain(midiSetup_.midiOut(), outDeviceBefore_);
}
