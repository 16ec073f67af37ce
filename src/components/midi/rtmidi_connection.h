#pragma once

#include "components/midi/rtmidi_client.h"

#include <QStringList>

#include <rtmidi/RtMidi.h>

#include <functional>
#include <memory>
#include <string>

// One RtMidi client of the program and the device its port is connected to: what the In and
// the Out port share. The client is made on first use, on the MIDI system chosen, so a JACK
// server started after the program is found the next time the devices are listed.
template <class Client>
class RtMidiConnection {
  public:
    // Prepares a fresh client before any port opens; false discards it.
    using Prepare = std::function<bool(Client&)>;

    RtMidiConnection(std::string clientName, std::string portName, Prepare prepare = {})
        : clientName_(std::move(clientName)),
          portName_(std::move(portName)),
          prepare_(std::move(prepare)) {}
    ~RtMidiConnection() { close(); }

    // nullptr while no MIDI system is available.
    Client* client() {
        if (midi_) return midi_.get();
        midi_ = MakeRtMidiClient<Client>(system_, clientName_);
        if (!midi_) return nullptr;
        KeepErrorsIn(*midi_, lastMidiError_);
        if (prepare_ && !prepare_(*midi_)) midi_.reset();
        return midi_.get();
    }

    QStringList deviceNames() {
        QStringList names;
        if (Client* midi = client()) {
            for (const ForeignPort& port : ForeignPorts(*midi)) names.append(port.name);
        }
        return names;
    }

    bool open(int deviceIndex) {
        close();
        Client* midi = client();
        errorText_ = midi ? OpenForeignPort(*midi, deviceIndex, portName_, lastMidiError_)
                          : NoMidiSystemText();
        if (!errorText_.isEmpty()) return false;
        openDevice_ = deviceIndex;
        return true;
    }

    void close() {
        CloseQuietly(midi_.get());
        openDevice_ = -1;
    }

    // Closes the port and drops the client; the next use makes one on `system`.
    void setSystem(MidiSystem system) {
        close();
        midi_.reset();
        system_ = system;
    }

    bool isOpen() const { return openDevice_ >= 0; }
    int deviceIndex() const { return openDevice_; }
    const QString& errorText() const { return errorText_; }

  private:
    std::string clientName_;
    std::string portName_;
    Prepare prepare_;
    MidiSystem system_ = MidiSystem::Automatic;
    std::unique_ptr<Client> midi_;
    std::string lastMidiError_;
    int openDevice_ = -1;
    QString errorText_;
};
