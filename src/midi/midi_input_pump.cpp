#include "midi/midi_input_pump.h"

#include "components/midi/midi_port.h"
#include "engine/input_dispatcher.h"
#include "engine/note_slots.h"

namespace {

constexpr int kNoteOff = 128;
constexpr int kNoteOn = 144;
constexpr int kPolyPressure = 160;
constexpr int kController = 176;
constexpr int kProgramChange = 192;

// Note-offs, note-ons and controllers (a sustain pedal can strike a wave pad). Pitch bend,
// pressure and program changes carry values, not notes, in their first data byte.
bool PlaysSlots(int status) {
    return (status >= kNoteOff && status < kPolyPressure) ||
           (status >= kController && status < kProgramChange);
}

}  // namespace

MidiInputPump::MidiInputPump(MidiInputPort& midiIn, InputDispatcher& dispatcher,
                             KeyDisplayFunction showKey, QObject* parent)
    : QObject(parent), midiIn_(midiIn), dispatcher_(dispatcher), showKey_(std::move(showKey)) {
    connect(&midiIn_, &MidiInputPort::messagesWaiting, this, &MidiInputPump::Pump);
}

// Drains the whole queue in arrival order. Each message leaves the queue before it is handled, so
// a call made from an event loop that a handled message opened (a message box) goes on with the
// next ones instead of waiting or handling one twice.
void MidiInputPump::Pump() {
    ShortMessage message;
    while (midiIn_.queueLength() > 0 && midiIn_.head(message)) {
        midiIn_.removeHead();
        if (discarding_ == 0) Handle(message.status, message.data1, message.data2);
    }
}

void MidiInputPump::EndDiscarding() {
    if (discarding_ == 0) return;
    Pump();  // what came while the dialog was open is dropped too
    --discarding_;
}

void MidiInputPump::Handle(int status, int data1, int data2) {
    if (!IsPad(data1) || !PlaysSlots(status)) return;
    dispatcher_.ProcessInputData(status, data1, data2);
    if (!showKey_) return;
    if (status == kNoteOn) showKey_(data1, data2 > 0);
    if (status == kNoteOff) showKey_(data1, false);
}
