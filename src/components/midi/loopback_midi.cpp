#include "components/midi/loopback_midi.h"

namespace {

// "" when the index names a listed device, else why it cannot be opened.
QString DeviceError(const QStringList& names, int deviceIndex) {
    if (deviceIndex >= 0 && deviceIndex < names.size()) return QString();
    return QStringLiteral("There is no MIDI device %1").arg(deviceIndex);
}

}  // namespace

LoopbackMidiInput::LoopbackMidiInput(QStringList deviceNames, QObject* parent)
    : QueuedMidiInput(parent), deviceNames_(std::move(deviceNames)) {}

bool LoopbackMidiInput::open(int deviceIndex) {
    close();
    errorText_ = DeviceError(deviceNames_, deviceIndex);
    if (!errorText_.isEmpty()) return false;
    discardWaiting();
    openDevice_ = deviceIndex;
    return true;
}

void LoopbackMidiInput::close() {
    openDevice_ = -1;
}

void LoopbackMidiInput::inject(const ShortMessage& message) {
    if (isOpen()) deliver(message);
}

LoopbackMidiOutput::LoopbackMidiOutput(QStringList deviceNames)
    : deviceNames_(std::move(deviceNames)) {}

bool LoopbackMidiOutput::open(int deviceIndex) {
    close();
    errorText_ = DeviceError(deviceNames_, deviceIndex);
    if (!errorText_.isEmpty()) return false;
    openDevice_ = deviceIndex;
    return true;
}

void LoopbackMidiOutput::send(const ShortMessage& message) {
    if (!isOpen()) return;
    sent.push_back(message);
    if (forwardTo_ != nullptr) forwardTo_->inject(message);
}
