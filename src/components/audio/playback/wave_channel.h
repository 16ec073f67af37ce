#pragma once

#include <QObject>
#include <QString>

// How far a channel's file is from being playable.
enum class FileReadiness { Ready, Decoding, Failed };

// One pad's wave channel. Units: frequency in Hz (0 = the file's own rate), volume in
// hundredths of a decibel (-5000..0), pan -10000 (left)..10000 (right).
//
// A channel may decode its file on a worker thread. It is told the file when it is assigned
// (load) and again on every press (prepare); a start made while the file decodes sounds once it
// is ready, unless a stop comes first. Backends that decode at once keep the defaults, which
// load through setFileName.
class WaveChannel {
  public:
    virtual ~WaveChannel() = default;

    // Loads the file for the next start, here and now; "" unloads. False (and an error text) when
    // it cannot load.
    virtual bool setFileName(const QString& path) = 0;
    // Hands the channel its file without waiting for the decode; "" unloads. False (and an error
    // text) when it is refused at once, a missing file say; a decode that fails later is
    // announced by WaveChannels::loaded.
    virtual bool load(const QString& path) { return setFileName(path); }
    // Before a start: makes the file the channel's sound, decoding it afresh when it changed on
    // disk. Decoding means the start will wait for it; Failed gives lastError().
    virtual FileReadiness prepare(const QString& path) {
        return setFileName(path) ? FileReadiness::Ready : FileReadiness::Failed;
    }
    virtual QString fileName() const = 0;
    virtual QString lastError() const = 0;

    virtual void setFrequency(int hertz) = 0;
    virtual void setLooping(bool looping) = 0;
    virtual void setVolume(int hundredthsOfDecibel) = 0;
    virtual void setPan(int pan) = 0;

    // Plays from the beginning, or once the file is decoded; false when nothing is loaded or the
    // sound cannot start.
    virtual bool start() = 0;
    // Stops the sound, or the start still waiting for its file.
    virtual void stop() = 0;
    // Releases the loaded wave.
    virtual void close() = 0;
    // The user-interface thread's view: true from a start until a stop or a delivered end notice,
    // the wait for the file included.
    virtual bool isPlaying() const = 0;
    // The output peaks (0..1) of the last period, for the pad's level meters.
    virtual float peakLeft() const { return 0.0f; }
    virtual float peakRight() const { return 0.0f; }
};

// The sixteen pad channels, indexed by pad note 57..72, and their notices.
class WaveChannels : public QObject {
    Q_OBJECT
  public:
    using QObject::QObject;
    virtual WaveChannel& channel(int padNote) = 0;

  signals:
    // A non-looped sound ended by itself; delivered on the user-interface thread.
    void playbackEnded(int padNote);
    // A decode on the worker finished: the pad's sound is ready (a start that waited for it now
    // sounds) or it failed, and `error` names the file and why.
    void loaded(int padNote, bool ok, const QString& error);
    // How far the decodes under way have come, 0..100, once they take longer than a moment; 100
    // when the last one is done.
    void loadProgress(int percent);
};
