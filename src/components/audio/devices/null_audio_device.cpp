#include "components/audio/devices/null_audio_device.h"

#include <algorithm>

namespace {

AudioStreamFormat Bounded(AudioStreamFormat format, int channels) {
    format.sampleRate = std::max(format.sampleRate, 1000);
    format.periodFrames = std::clamp(format.periodFrames, 16, 65536);
    format.channels = channels;
    return format;
}

std::size_t Samples(const AudioStreamFormat& format) {
    return static_cast<std::size_t>(format.periodFrames) *
           static_cast<std::size_t>(format.channels);
}

}  // namespace

NullOutputDevice::NullOutputDevice(AudioStreamFormat format)
    : format_(Bounded(format, 2)), period_(Samples(format_)) {}

bool NullOutputDevice::start(AudioRenderer& renderer) {
    return clock_.start(format_.sampleRate, format_.periodFrames, [this, &renderer] {
        renderer.render(period_.data(), format_.periodFrames);
    });
}

NullInputDevice::NullInputDevice(AudioStreamFormat format)
    : format_(Bounded(format, std::clamp(format.channels, 1, 2))), silence_(Samples(format_)) {}

bool NullInputDevice::start(AudioCaptureSink& sink) {
    return clock_.start(format_.sampleRate, format_.periodFrames, [this, &sink] {
        sink.capture(silence_.data(), format_.periodFrames, format_.channels);
    });
}
