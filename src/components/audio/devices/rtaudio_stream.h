#pragma once

#include "components/audio/devices/audio_api.h"
#include "components/audio/devices/audio_device.h"

#include <QString>
#include <QStringList>

#include <memory>

class RtAudio;

// One RtAudio stream in one direction, float and interleaved, at the device's own rate. The
// output and input devices build on it; it turns every RtAudio failure into an error text.
class RtAudioStream {
  public:
    enum class Direction { Output, Input };
    // RtAudio's callback: (output, input, frames, stream time, status, user data).
    using Callback = int (*)(void*, void*, unsigned int, double, unsigned int, void*);

    // An empty device name takes the API's default device.
    RtAudioStream(AudioApi api, QString deviceName, Direction direction, int channels,
                  int periodFrames);
    ~RtAudioStream();
    RtAudioStream(const RtAudioStream&) = delete;
    RtAudioStream& operator=(const RtAudioStream&) = delete;

    // Opens the stream without starting it; format() holds the rate and period from then on.
    bool open(Callback callback, void* user);
    bool start();
    // Stops at once (nothing is drained) and closes.
    void close();

    bool isOpen() const { return audio_ != nullptr; }
    bool isRunning() const { return running_; }
    AudioStreamFormat format() const { return format_; }
    QString description() const;
    QString errorText() const { return error_; }

  private:
    bool Fail(const QString& reason);

    AudioApi api_;
    QString deviceName_;
    Direction direction_;
    int channels_;
    int periodFrames_;
    std::unique_ptr<RtAudio> audio_;
    AudioStreamFormat format_;
    bool running_ = false;
    QString error_;
};

// The names of the devices that can play (Output) or record (Input) through the API.
QStringList RtAudioDeviceNames(AudioApi api, RtAudioStream::Direction direction);
