#include "components/audio/devices/rtaudio_input_device.h"

#include <rtaudio/RtAudio.h>

#include <algorithm>

RtAudioInputDevice::RtAudioInputDevice(AudioApi api, const QString& deviceName, int channels,
                                       int periodFrames)
    : stream_(api, deviceName, RtAudioStream::Direction::Input, std::clamp(channels, 1, 2),
              periodFrames) {}

RtAudioInputDevice::~RtAudioInputDevice() {
    stop();
}

bool RtAudioInputDevice::open() {
    if (!stream_.open(&RtAudioInputDevice::Callback, this)) return false;
    channels_ = stream_.format().channels;
    return true;
}

bool RtAudioInputDevice::start(AudioCaptureSink& sink) {
    if (stream_.isRunning()) return false;
    if (!stream_.isOpen() && !open()) return false;
    sink_ = &sink;
    return stream_.start();
}

void RtAudioInputDevice::stop() {
    stream_.close();
    sink_ = nullptr;
}

int RtAudioInputDevice::Callback(void*, void* input, unsigned int frames, double,
                                 unsigned int status, void* self) {
    auto& device = *static_cast<RtAudioInputDevice*>(self);
    if (status & RTAUDIO_INPUT_OVERFLOW) device.overflows_.fetch_add(1, std::memory_order_relaxed);
    device.sink_->capture(static_cast<const float*>(input), static_cast<int>(frames),
                          device.channels_);
    return 0;
}
