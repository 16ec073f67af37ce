#include "components/servers/pulse_probe.h"

#include <QByteArray>
#include <QList>

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <cstring>

namespace {

bool SocketAnswers(const QByteArray& path) {
    sockaddr_un address{};
    if (path.isEmpty() || path.size() >= static_cast<int>(sizeof(address.sun_path))) return false;
    const int fd = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    if (fd < 0) return false;
    address.sun_family = AF_UNIX;
    std::memcpy(address.sun_path, path.constData(), static_cast<std::size_t>(path.size()));
    const bool answered =
        ::connect(fd, reinterpret_cast<const sockaddr*>(&address), sizeof(address)) == 0;
    ::close(fd);
    return answered;
}

// One entry of PULSE_SERVER: "unix:/path", "/path", "tcp:host:port", optionally "{id}..."
bool ServerAnswers(QByteArray entry) {
    if (entry.startsWith('{')) entry = entry.mid(entry.indexOf('}') + 1);
    if (entry.startsWith("unix:")) return SocketAnswers(entry.mid(5));
    if (entry.startsWith('/')) return SocketAnswers(entry);
    return !entry.isEmpty();
}

}  // namespace

bool PulseServerAnswers() {
    const QByteArray servers = qgetenv("PULSE_SERVER");
    if (!servers.trimmed().isEmpty()) {
        for (const QByteArray& entry : servers.simplified().split(' ')) {
            if (ServerAnswers(entry)) return true;
        }
        return false;
    }
    const QByteArray runtime = qgetenv("XDG_RUNTIME_DIR");
    QList<QByteArray> sockets;
    if (!runtime.isEmpty()) sockets << runtime + "/pulse/native";
    sockets << QByteArray("/run/user/") + QByteArray::number(::getuid()) + "/pulse/native"
            << QByteArray("/var/run/pulse/native");
    for (const QByteArray& path : sockets) {
        if (SocketAnswers(path)) return true;
    }
    return false;
}
