#include "engine/wave_playback.h"

#include "base/text_values.h"
#include "components/audio/playback/wave_channel.h"
#include "components/prompts/prompts.h"

#include <utility>

WavePlayback::WavePlayback(Context& context, WaveChannels& channels, Prompts& prompts,
                           QObject* parent)
    : QObject(parent), context_(context), channels_(channels), prompts_(prompts) {
    connect(&channels_, &WaveChannels::playbackEnded, this, &WavePlayback::OnPlaybackEnded);
    connect(&channels_, &WaveChannels::loaded, this,
            [this](int note, bool ok) { OnLoaded(note, ok); });
}

void WavePlayback::PlayWave(int note) {
    if (!IsPad(note)) return;
    NoteSlot& slot = context_.NoteSlots[note];
    if (slot.WaveAssigned == QLatin1String("False")) return;

    WaveChannel& channel = channels_.channel(note);
    if (channel.isPlaying()) {
        channel.stop();
        waitingForFile_[note - kFirstPad] = false;
        slot.WavePlaying = BooleanText(false);
        return;
    }
    if (!StartChannel(note)) {
        // Nothing sounds, so the pad must not look as if it did: a once-only pad would otherwise
        // never try again, even after its file is back.
        slot.WavePlaying = BooleanText(false);
        ReportFailure(note);
    }
}

void WavePlayback::ReportFailure(int note) {
    bool& reported = failureReported_[note - kFirstPad];
    if (reported) return;
    reported = true;
    const NoteSlot& slot = context_.NoteSlots[note];
    QString text = QStringLiteral("Problem playing specified audio file\n\nPad note %1: %2")
                       .arg(note)
                       .arg(slot.WaveFileName);
    const QString reason = channels_.channel(note).lastError();
    if (!reason.isEmpty()) text += u'\n' + reason;
    QMetaObject::invokeMethod(
        this,
        [this, note, text] {
            prompts_.message(Notice(text, PromptIcon::Critical));
            failureReported_[note - kFirstPad] = false;
        },
        Qt::QueuedConnection);
}

// Hands the slot's settings to the channel in their fixed order and starts it; false as soon as a
// step fails. Settings made before the failing step stay made.
bool WavePlayback::StartChannel(int note) {
    NoteSlot& slot = context_.NoteSlots[note];
    WaveChannel& channel = channels_.channel(note);
    const FileReadiness readiness = channel.prepare(slot.WaveFileName);
    if (readiness == FileReadiness::Failed) return false;
    const std::optional<int> frequency = StrictWholeNumber(slot.WaveFrequency);
    if (!frequency) return false;
    channel.setFrequency(*frequency);
    const std::optional<bool> looped = StrictBoolean(slot.WaveLooped);
    if (!looped) return false;
    channel.setLooping(*looped);
    const std::optional<int> volume = StrictWholeNumber(slot.WaveVolume);
    if (!volume) return false;
    channel.setVolume(*volume);
    const std::optional<int> pan = StrictWholeNumber(slot.WavePan);
    if (!pan) return false;
    channel.setPan(*pan);
    slot.WavePlaying = BooleanText(true);
    if (!channel.start()) return false;
    waitingForFile_[note - kFirstPad] = readiness == FileReadiness::Decoding;
    return true;
}

void WavePlayback::StopWave(int note) {
    if (!IsPad(note)) return;
    WaveChannel& channel = channels_.channel(note);
    if (!channel.isPlaying()) return;
    channel.stop();
    waitingForFile_[note - kFirstPad] = false;
    context_.NoteSlots[note].WavePlaying = BooleanText(false);
}

void WavePlayback::AllWaveSoundsOff() {
    for (int note = kFirstPad; note <= kLastPad; ++note) StopWave(note);
}

void WavePlayback::OnPlaybackEnded(int note) {
    if (!IsPad(note)) return;
    waitingForFile_[note - kFirstPad] = false;
    context_.NoteSlots[note].WavePlaying = BooleanText(false);
}

// A start that waited for its file: the channel has started it by itself, or the decode failed
// and the pad is reported as if it had failed at the press. A pad given another file meanwhile
// (a setup file opened) no longer waits: its slot says it is not playing.
void WavePlayback::OnLoaded(int note, bool ok) {
    if (!IsPad(note) || !std::exchange(waitingForFile_[note - kFirstPad], false) || ok) return;
    QString& playing = context_.NoteSlots[note].WavePlaying;
    if (playing != BooleanText(true)) return;
    playing = BooleanText(false);
    ReportFailure(note);
}
