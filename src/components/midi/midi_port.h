#pragma once

#include "components/midi/midi_system.h"

#include <QObject>
#include <QStringList>

#include <cstdint>

// A three-byte MIDI channel message; a missing data byte of a shorter message reads as 0.
struct ShortMessage {
    std::uint8_t status = 0;
    std::uint8_t data1 = 0;
    std::uint8_t data2 = 0;
    bool operator==(const ShortMessage&) const = default;
};

// The MIDI In port. Devices are numbered 0..count-1 in a stable order; the program's own ports
// are never among them. After a successful open, incoming messages wait in a bounded queue and
// messagesWaiting() is emitted on the user-interface thread; the reader drains the queue.
class MidiInputPort : public QObject {
    Q_OBJECT
  public:
    using QObject::QObject;

    virtual QStringList deviceNames() const = 0;
    int deviceCount() const { return static_cast<int>(deviceNames().size()); }

    // Opens the device and starts input. False (and errorText()) when the index is not a device
    // or the device refuses; the port is then closed.
    virtual bool open(int deviceIndex) = 0;
    virtual void close() = 0;
    virtual bool isOpen() const = 0;
    virtual int deviceIndex() const = 0;  // -1 while closed
    virtual QString errorText() const = 0;
    // Closes the port; its devices are then those of `system`. Ports without a choice ignore it.
    virtual void setMidiSystem(MidiSystem) {}

    virtual int queueLength() const = 0;
    // The oldest waiting message; false when none waits.
    virtual bool head(ShortMessage& message) const = 0;
    virtual void removeHead() = 0;

  signals:
    void messagesWaiting();
};

// The MIDI Out port: sends each short message at once.
class MidiOutputPort {
  public:
    virtual ~MidiOutputPort() = default;

    virtual QStringList deviceNames() const = 0;
    int deviceCount() const { return static_cast<int>(deviceNames().size()); }

    virtual bool open(int deviceIndex) = 0;
    virtual void close() = 0;
    virtual bool isOpen() const = 0;
    virtual int deviceIndex() const = 0;  // -1 while no valid device is set
    virtual QString errorText() const = 0;
    // Closes the port; its devices are then those of `system`. Ports without a choice ignore it.
    virtual void setMidiSystem(MidiSystem) {}

    // Does nothing while the port is closed.
    virtual void send(const ShortMessage& message) = 0;
};
