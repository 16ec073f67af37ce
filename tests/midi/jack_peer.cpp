#include "jack_peer.h"

#include <QCoreApplication>
#include <QStringList>

#ifdef OQ_HAVE_JACK
#include <jack/jack.h>
#endif

namespace {

template <class Client>
QStringList PortNames(Client& midi) {
    QStringList names;
    for (unsigned int i = 0; i < midi.getPortCount(); ++i) {
        names.append(QString::fromStdString(midi.getPortName(i)));
    }
    return names;
}

}  // namespace

bool JackServerReachable() {
#ifdef OQ_HAVE_JACK
    jack_set_error_function([](const char*) {});
    jack_set_info_function([](const char*) {});
    jack_client_t* client = jack_client_open("oq-test-probe", JackNoStartServer, nullptr);
    jack_set_error_function(nullptr);
    jack_set_info_function(nullptr);
    if (client == nullptr) return false;
    jack_client_close(client);
    return true;
#else
    return false;
#endif
}

// Unique per test process, so test programs running side by side do not share a peer.
std::string JackPeer::ClientName(const char* role) {
    return "oq-test-" + std::string(role) + "-" +
           std::to_string(QCoreApplication::applicationPid());
}

QString JackPeer::portName() const {
    return QString::fromStdString(clientName_ + ":" + port_);
}

JackPeerInput::JackPeerInput() {
    clientName_ = ClientName("listener");
    port_ = "from-program";
    midi_ = std::make_unique<RtMidiIn>(RtMidi::UNIX_JACK, clientName_);
    midi_->setCallback(&JackPeerInput::OnMessage, this);
    midi_->openVirtualPort(port_);
}

void JackPeerInput::OnMessage(double, std::vector<unsigned char>* bytes, void* self) {
    auto* peer = static_cast<JackPeerInput*>(self);
    ShortMessage message;
    message.status = bytes->at(0);
    if (bytes->size() > 1) message.data1 = (*bytes)[1];
    if (bytes->size() > 2) message.data2 = (*bytes)[2];
    std::lock_guard lock(peer->mutex_);
    peer->received_.push_back(message);
}

std::vector<ShortMessage> JackPeerInput::received() const {
    std::lock_guard lock(mutex_);
    return received_;
}

QStringList JackPeerInput::sources() {
    return PortNames(*midi_);
}

JackPeerOutput::JackPeerOutput() {
    clientName_ = ClientName("player");
    port_ = "to-program";
    midi_ = std::make_unique<RtMidiOut>(RtMidi::UNIX_JACK, clientName_);
    midi_->openVirtualPort(port_);
}

void JackPeerOutput::send(std::vector<unsigned char> bytes) {
    midi_->sendMessage(&bytes);
}

QStringList JackPeerOutput::destinations() {
    return PortNames(*midi_);
}
