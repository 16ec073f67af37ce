#include "jack_peer.h"

#include <QCoreApplication>

namespace {

std::string ClientName(const char* role) {
    return "oq-test-" + std::string(role) + "-" +
           std::to_string(QCoreApplication::applicationPid());
}

QStringList PortNames(RtMidi& midi) {
    QStringList names;
    for (unsigned int i = 0; i < midi.getPortCount(); ++i)
        names.append(QString::fromStdString(midi.getPortName(i)));
    return names;
}

}  // namespace

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
