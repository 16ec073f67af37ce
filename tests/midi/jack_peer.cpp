#include "jack_peer.h"

#include <QCoreApplication>

#ifdef OQ_HAVE_JACK
#include <jack/jack.h>
#endif

namespace {

std::string ClientName(const char* role) {
    return "oq-test-" + std::string(role) + "-" +
           std::to_string(QCoreApplication::applicationPid());
}

QStringList PortNames(RtMidi& midi) {
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

JackPeer::JackPeer()
    : listener_(RtMidi::UNIX_JACK, ClientName("listener")),
      player_(RtMidi::UNIX_JACK, ClientName("player")) {
    listener_.setCallback(&JackPeer::OnMessage, this);
    listener_.openVirtualPort("from-program");
    player_.openVirtualPort("to-program");
}

QString JackPeer::listeningPort() const {
    return QString::fromStdString(ClientName("listener") + ":from-program");
}

QString JackPeer::playingPort() const {
    return QString::fromStdString(ClientName("player") + ":to-program");
}

void JackPeer::OnMessage(double, std::vector<unsigned char>* bytes, void* self) {
    ShortMessage message;
    message.status = bytes->at(0);
    if (bytes->size() > 1) message.data1 = (*bytes)[1];
    if (bytes->size() > 2) message.data2 = (*bytes)[2];
    auto* peer = static_cast<JackPeer*>(self);
    std::lock_guard lock(peer->mutex_);
    peer->received_.push_back(message);
}

std::vector<ShortMessage> JackPeer::received() const {
    std::lock_guard lock(mutex_);
    return received_;
}

QStringList JackPeer::sources() {
    return PortNames(listener_);
}

QStringList JackPeer::destinations() {
    return PortNames(player_);
}
