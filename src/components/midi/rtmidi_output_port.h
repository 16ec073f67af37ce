#pragma once

#include "components/midi/midi_port.h"
#include "components/midi/rtmidi_connection.h"

// MIDI Out through RtMidi (ALSA sequencer or JACK).
class RtMidiOutputPort : public MidiOutputPort {
  public:
    RtMidiOutputPort();

    QStringList deviceNames() const override { return connection_.deviceNames(); }
    bool open(int deviceIndex) override { return connection_.open(deviceIndex); }
    void close() override { connection_.close(); }
    bool isOpen() const override { return connection_.isOpen(); }
    int deviceIndex() const override { return connection_.deviceIndex(); }
    QString errorText() const override { return connection_.errorText(); }
    void setMidiSystem(MidiSystem system) override { connection_.setSystem(system); }

    // Sends the bytes the status calls for; a message that is not a valid short message is
    // dropped rather than sent as something else.
    void send(const ShortMessage& message) override;

  private:
    mutable RtMidiConnection<RtMidiOut> connection_;
};
