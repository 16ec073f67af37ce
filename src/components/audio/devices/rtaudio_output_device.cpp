#include "components/audio/devices/rtaudio_output_device.h"

#include <rtaudio/RtAudio.h>

RtAudioOutputDevice::RtAudioOutputDevice(AudioApi api, const QString& deviceName, int periodFrames)
    : stream_(api, deviceName, RtAudioStream::Direction::Output, 2, periodFrames) {}

RtAudioOutputDevice::~RtAudioOutputDevice() {
    stop();
}

bool RtAudioOutputDevice::open() {
    return stream_.open(&RtAudioOutputDevice::Callback, this);
}

bool RtAudioOutputDevice::start(AudioRenderer& renderer) {
    if (stream_.isRunning()) return false;
    if (!stream_.isOpen() && !open()) return false;
    renderer_ = &renderer;
    return stream_.start();
}

void RtAudioOutputDevice::stop() {
    stream_.close();
    renderer_ = nullptr;
}

int RtAudioOutputDevice::Callback(void* output, void*, unsigned int frames, double,
                                  unsigned int status, void* self) {
    auto& device = *static_cast<RtAudioOutputDevice*>(self);
    if (status & RTAUDIO_OUTPUT_UNDERFLOW) {
        device.underflows_.fetch_add(1, std::memory_order_relaxed);
    }
    device.renderer_->render(static_cast<float*>(output), static_cast<int>(frames));
    return 0;
}
