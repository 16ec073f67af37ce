#include "components/midi/rtmidi_output_port.h"

#include <rtmidi/RtMidi.h>

RtMidiOutputPort::RtMidiOutputPort() : connection_(kOwnOutputClientName, "out") {}

void RtMidiOutputPort::send(const ShortMessage& message) {
    const int length = WireLength(message);
    if (!isOpen() || length == 0) return;
    const unsigned char bytes[3] = {message.status, message.data1, message.data2};
    try {
        connection_.client()->sendMessage(bytes, static_cast<std::size_t>(length));
    } catch (const RtMidiError&) {
        // A lost message is all a failed send costs; the port stays as it is.
    }
}
