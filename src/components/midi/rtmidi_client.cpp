#include "components/midi/rtmidi_client.h"

#include <QRegularExpression>

#include <rtmidi/RtMidi.h>

namespace {

template <class Client>
std::unique_ptr<Client> MakeOn(MidiSystem system, const std::string& clientName) {
    if (!MidiSystemPresent(system)) return nullptr;
    const RtMidi::Api api = system == MidiSystem::Jack ? RtMidi::UNIX_JACK : RtMidi::LINUX_ALSA;
    try {
        return std::make_unique<Client>(api, clientName);
    } catch (const RtMidiError&) {
        return nullptr;
    }
}

}  // namespace

template <class Client>
std::unique_ptr<Client> MakeRtMidiClient(MidiSystem system, const std::string& clientName) {
    if (system != MidiSystem::Automatic) return MakeOn<Client>(system, clientName);
    // A JACK server that refuses a client leaves the ALSA sequencer to try.
    if (auto client = MakeOn<Client>(MidiSystem::Jack, clientName)) return client;
    return MakeOn<Client>(MidiSystem::Alsa, clientName);
}

template std::unique_ptr<RtMidiIn> MakeRtMidiClient(MidiSystem, const std::string&);
template std::unique_ptr<RtMidiOut> MakeRtMidiClient(MidiSystem, const std::string&);

QList<ForeignPort> ForeignPorts(RtMidi& midi) {
    QList<ForeignPort> ports;
    try {
        const unsigned int count = midi.getPortCount();
        for (unsigned int number = 0; number < count; ++number) {
            const QString name = QString::fromStdString(midi.getPortName(number));
            if (!name.isEmpty() && !IsOwnPort(name)) ports.append({number, name});
        }
    } catch (const RtMidiError&) {
        // A system that fails to list its ports offers none.
    }
    return ports;
}

// Both systems name a port "client:port..."; JACK appends "-NN" to a client name already taken,
// as when a second copy of the program runs.
bool IsOwnPort(const QString& portName) {
    static const QRegularExpression ownClient(
        QStringLiteral("^(%1|%2)(-\\d+)?:")
            .arg(QRegularExpression::escape(QLatin1String(kOwnInputClientName)),
                 QRegularExpression::escape(QLatin1String(kOwnOutputClientName))));
    return ownClient.match(portName).hasMatch();
}

void KeepErrorsIn(RtMidi& midi, std::string& lastError) {
    midi.setErrorCallback([](RtMidiError::Type, const std::string& text,
                             void* sink) { *static_cast<std::string*>(sink) = text; },
                          &lastError);
}

QString OpenForeignPort(RtMidi& midi, int deviceIndex, const std::string& ownPortName,
                        std::string& lastError) {
    const QList<ForeignPort> ports = ForeignPorts(midi);
    if (deviceIndex < 0 || deviceIndex >= ports.size()) {
        return QStringLiteral("There is no MIDI device %1").arg(deviceIndex);
    }
    lastError.clear();
    try {
        midi.openPort(ports[deviceIndex].number, ownPortName);
    } catch (const RtMidiError& error) {
        lastError = error.getMessage();
    }
    if (midi.isPortOpen()) return QString();
    if (lastError.empty()) return QStringLiteral("Could not open ") + ports[deviceIndex].name;
    return QString::fromStdString(lastError);
}

void CloseQuietly(RtMidi* midi) {
    if (midi == nullptr) return;
    try {
        if (midi->isPortOpen()) midi->closePort();
    } catch (const RtMidiError&) {
        // Closed as far as we are concerned.
    }
}

QString NoMidiSystemText() {
    return QStringLiteral("No MIDI system (ALSA sequencer or JACK server) is available");
}

int WireLength(const ShortMessage& message) {
    const int status = message.status;
    int length = 0;
    if (status >= 0xC0 && status <= 0xDF) {
        length = 2;  // program change and channel pressure carry one data byte
    } else if (status >= 0x80 && status <= 0xEF) {
        length = 3;
    } else if (status == 0xF1 || status == 0xF3) {
        length = 2;
    } else if (status == 0xF2) {
        length = 3;
    } else if (status == 0xF6 || status >= 0xF8) {
        length = 1;
    }
    if (length >= 2 && message.data1 > 127) return 0;
    if (length == 3 && message.data2 > 127) return 0;
    return length;
}
