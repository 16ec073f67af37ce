#include "components/midi/rtmidi_input_port.h"

#include <rtmidi/RtMidi.h>

RtMidiInputPort::RtMidiInputPort(QObject* parent)
    : QueuedMidiInput(parent),
      connection_(kOwnInputClientName, "in", [this](RtMidiIn& midi) { return Prepare(midi); }) {}

RtMidiInputPort::~RtMidiInputPort() {
    // Stops the callback before the queue it fills goes away.
    close();
}

bool RtMidiInputPort::Prepare(RtMidiIn& midi) {
    try {
        midi.ignoreTypes(true, true, true);
        midi.setCallback(&RtMidiInputPort::OnMessage, this);
        return true;
    } catch (const RtMidiError&) {
        return false;
    }
}

bool RtMidiInputPort::open(int deviceIndex) {
    connection_.close();
    discardWaiting();
    return connection_.open(deviceIndex);
}

void RtMidiInputPort::setMidiSystem(MidiSystem system) {
    connection_.setSystem(system);
    discardWaiting();
}

// Runs on the MIDI system's thread (JACK's process thread): nothing here may allocate or lock.
void RtMidiInputPort::OnMessage(double, std::vector<unsigned char>* bytes, void* self) {
    if (bytes == nullptr || bytes->empty()) return;
    const std::size_t size = bytes->size();
    ShortMessage message;
    message.status = (*bytes)[0];
    if (size > 1) message.data1 = (*bytes)[1];
    if (size > 2) message.data2 = (*bytes)[2];
    static_cast<RtMidiInputPort*>(self)->deliver(message);
}
