#pragma once

#include "components/midi/midi_port.h"
#include "components/servers/jack_probe.h"
#include "support/sound_servers.h"

#include <QStringList>

#include <rtmidi/RtMidi.h>

#include <mutex>
#include <vector>

#define REQUIRE_JACK_SERVER() REQUIRE_SOUND_SERVER(JackServerRunning(), "JACK")

// Another JACK MIDI program with a virtual port in each direction, which the program sees as a
// MIDI Out and a MIDI In device. Its client names hold the process id, so test programs
// running side by side do not share a peer.
class JackPeer {
  public:
    JackPeer();

    QString listeningPort() const;  // a MIDI Out device to the program
    QString playingPort() const;    // a MIDI In device to the program

    void send(std::vector<unsigned char> bytes) { player_.sendMessage(&bytes); }
    std::vector<ShortMessage> received() const;
    // The ports this peer could listen to and play into.
    QStringList sources();
    QStringList destinations();

  private:
    static void OnMessage(double, std::vector<unsigned char>* bytes, void* self);

    RtMidiIn listener_;
    RtMidiOut player_;
    mutable std::mutex mutex_;
    std::vector<ShortMessage> received_;
};
