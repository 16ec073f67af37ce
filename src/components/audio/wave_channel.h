#pragma once

#include <QObject>
#include <QString>

// One pad's wave channel. Units: frequency in Hz (0 = the file's own rate), volume in
// hundredths of a decibel (-5000..0), pan -10000 (left)..10000 (right).
class WaveChannel {
  public:
    virtual ~WaveChannel() = default;

    // Loads the file for the next start; "" unloads. False (and an error text) when it cannot load.
    virtual bool setFileName(const QString& path) = 0;
    virtual QString fileName() const = 0;
    virtual QString lastError() const = 0;

    virtual void setFrequency(int hertz) = 0;
    virtual void setLooping(bool looping) = 0;
    virtual void setVolume(int hundredthsOfDecibel) = 0;
    virtual void setPan(int pan) = 0;

    // Plays from the beginning; false when nothing is loaded or the sound cannot start.
    virtual bool start() = 0;
    virtual void stop() = 0;
    // Releases the loaded wave.
    virtual void close() = 0;
    // The user-interface thread's view: true from a start until a stop or a delivered end notice.
    virtual bool isPlaying() const = 0;
    // The output peaks (0..1) of the last period, for the pad's level meters.
    virtual float peakLeft() const { return 0.0f; }
    virtual float peakRight() const { return 0.0f; }
};

// The sixteen pad channels, indexed by pad note 57..72, and the end-of-playback notice.
class WaveChannels : public QObject {
    Q_OBJECT
  public:
    using QObject::QObject;
    virtual WaveChannel& channel(int padNote) = 0;

  signals:
    // A non-looped sound ended by itself; delivered on the user-interface thread.
    void playbackEnded(int padNote);
};
