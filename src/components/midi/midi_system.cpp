#include "components/midi/midi_system.h"

#include "components/servers/jack_probe.h"

#include <QFileInfo>

#include <rtmidi/RtMidi.h>

#include <algorithm>
#include <vector>

namespace {

bool Compiled(RtMidi::Api api) {
    std::vector<RtMidi::Api> apis;
    RtMidi::getCompiledApi(apis);
    return std::find(apis.begin(), apis.end(), api) != apis.end();
}

}  // namespace

MidiSystem MidiSystemFromText(const QString& text) {
    const QString name = text.trimmed();
    if (name.compare(QLatin1String("JACK"), Qt::CaseInsensitive) == 0) return MidiSystem::Jack;
    if (name.compare(QLatin1String("ALSA"), Qt::CaseInsensitive) == 0) return MidiSystem::Alsa;
    return MidiSystem::Automatic;
}

QString MidiSystemText(MidiSystem system) {
    switch (system) {
        case MidiSystem::Jack:
            return QStringLiteral("JACK");
        case MidiSystem::Alsa:
            return QStringLiteral("ALSA");
        case MidiSystem::Automatic:
            break;
    }
    return QString();
}

QString MidiSystemChoiceName(MidiSystem system) {
    return system == MidiSystem::Automatic ? QStringLiteral("Automatic") : MidiSystemText(system);
}

// Without its device file the ALSA sequencer is not tried at all: RtMidi would only print a
// complaint and throw.
bool MidiSystemPresent(MidiSystem system) {
    switch (system) {
        case MidiSystem::Jack:
            return Compiled(RtMidi::UNIX_JACK) && JackServerRunning();
        case MidiSystem::Alsa:
            return Compiled(RtMidi::LINUX_ALSA) &&
                   QFileInfo::exists(QStringLiteral("/dev/snd/seq"));
        case MidiSystem::Automatic:
            break;
    }
    return MidiSystemPresent(ResolveMidiSystem(system));
}

MidiSystem ResolveMidiSystem(MidiSystem system) {
    if (system != MidiSystem::Automatic) return system;
    return MidiSystemPresent(MidiSystem::Jack) ? MidiSystem::Jack : MidiSystem::Alsa;
}

QString MidiSystemNote(MidiSystem system) {
    const MidiSystem resolved = ResolveMidiSystem(system);
    if (MidiSystemPresent(resolved)) {
        if (system != MidiSystem::Automatic) return QString();
        return QStringLiteral("Uses %1 now").arg(MidiSystemText(resolved));
    }
    if (system == MidiSystem::Jack) return QStringLiteral("no JACK server runs");
    if (system == MidiSystem::Alsa) return QStringLiteral("there is no ALSA sequencer");
    return QStringLiteral("no JACK server runs and there is no ALSA sequencer");
}
