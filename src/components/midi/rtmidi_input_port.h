#pragma once

#include "components/midi/queued_midi_input.h"
#include "components/midi/rtmidi_connection.h"

#include <vector>

// MIDI In through RtMidi (ALSA sequencer or JACK). Incoming system exclusive, timing and
// active-sensing messages are ignored; the rest is queued as three-byte messages.
class RtMidiInputPort : public QueuedMidiInput {
    Q_OBJECT
  public:
    explicit RtMidiInputPort(QObject* parent = nullptr);
    ~RtMidiInputPort() override;

    QStringList deviceNames() const override { return connection_.deviceNames(); }
    bool open(int deviceIndex) override;
    void close() override { connection_.close(); }
    bool isOpen() const override { return connection_.isOpen(); }
    int deviceIndex() const override { return connection_.deviceIndex(); }
    QString errorText() const override { return connection_.errorText(); }
    void setMidiSystem(MidiSystem system) override;

  private:
    bool Prepare(RtMidiIn& midi);
    static void OnMessage(double timeStamp, std::vector<unsigned char>* bytes, void* self);

    mutable RtMidiConnection<RtMidiIn> connection_;
};
