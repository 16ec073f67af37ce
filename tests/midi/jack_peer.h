#pragma once

#include "components/midi/midi_port.h"

#include <QString>

#include <rtmidi/RtMidi.h>

#include <memory>
#include <mutex>
#include <string>
#include <vector>

// True when a JACK server answers; never starts one and stays quiet when there is none.
bool JackServerReachable();

// Skips the test when no JACK server runs, except on CI (CI=true), where .ci/run starts one
// and its absence is a failure.
#define REQUIRE_JACK_SERVER()                                                                 \
    do {                                                                                      \
        if (!JackServerReachable()) {                                                         \
            if (qgetenv("CI") == "true") FAIL() << "CI runs a JACK server, but none answers"; \
            GTEST_SKIP() << "no JACK server (start one: jackd -n NAME -S --no-realtime -d "   \
                            "dummy, and export JACK_DEFAULT_SERVER=NAME)";                    \
        }                                                                                     \
    } while (false)

// Another JACK MIDI program: a client of its own with one virtual port that the program sees
// as a device.
class JackPeer {
  public:
    QString portName() const;

  protected:
    static std::string ClientName(const char* role);
    std::string clientName_;
    std::string port_;
};

// Receives whatever the program's MIDI Out sends to it.
class JackPeerInput : public JackPeer {
  public:
    JackPeerInput();
    std::vector<ShortMessage> received() const;
    // Names of the ports this client could listen to.
    QStringList sources();

  private:
    static void OnMessage(double, std::vector<unsigned char>* bytes, void* self);
    mutable std::mutex mutex_;
    std::vector<ShortMessage> received_;
    std::unique_ptr<RtMidiIn> midi_;
};

// Sends into the program's MIDI In.
class JackPeerOutput : public JackPeer {
  public:
    JackPeerOutput();
    void send(std::vector<unsigned char> bytes);
    QStringList destinations();

  private:
    std::unique_ptr<RtMidiOut> midi_;
};
