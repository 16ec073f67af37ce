#include "midi/midi_input_pump.h"

#include "components/midi/midi_port.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"

namespace {

constexpr int kNoteOff = 128;
constexpr int kNoteOn = 144;
constexpr int kPitchBendFirstChannel = 224;
constexpr int kActiveSensing = 254;

}  // namespace

MidiInputPump::MidiInputPump(MidiInputPort& midiIn, InputDispatcher& dispatcher,
                             KeyDisplayFunction showKey, QObject* parent)
    : QObject(parent), midiIn_(midiIn), dispatcher_(dispatcher), showKey_(std::move(showKey)) {
    connect(&midiIn_, &MidiInputPort::messagesWaiting, this, &MidiInputPump::Pump);
}

// Drains the whole queue in arrival order. A message box opened while a message is handled
// runs the event loop; the outer call keeps draining instead of handling a head twice.
void MidiInputPump::Pump() {
    if (pumping_) return;
    pumping_ = true;
    ShortMessage message;
    while (midiIn_.queueLength() > 0 && midiIn_.head(message)) {
        Handle(message.status, message.data1, message.data2);
        midiIn_.removeHead();
    }
    pumping_ = false;
}

void MidiInputPump::Handle(int status, int data1, int data2) {
    if (!IsPad(data1) || status == kActiveSensing || status == kPitchBendFirstChannel) return;
    dispatcher_.ProcessInputData(status, data1, data2);
    if (!showKey_) return;
    if (status == kNoteOn) showKey_(data1, data2 > 0);
    if (status == kNoteOff) showKey_(data1, false);
}
