#include "components/audio/playback/test_tone.h"

#include "components/audio/audio_engine.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace {

constexpr double kHertz = 440.0;
constexpr double kSeconds = 0.3;
constexpr double kLevel = 0.5;
constexpr double kRampSeconds = 0.01;

}  // namespace

std::shared_ptr<const SampleBuffer> MakeTestTone(int sampleRate) {
    auto tone = std::make_shared<SampleBuffer>();
    const int frames = static_cast<int>(std::lround(kSeconds * sampleRate));
    const double ramp = std::max(1.0, kRampSeconds * sampleRate);
    tone->samples.resize(static_cast<std::size_t>(frames));
    for (int i = 0; i < frames; ++i) {
        const double envelope = std::min({1.0, i / ramp, (frames - 1 - i) / ramp});
        const double phase = 2.0 * std::numbers::pi * kHertz * i / sampleRate;
        tone->samples[static_cast<std::size_t>(i)] =
            static_cast<float>(kLevel * envelope * std::sin(phase));
    }
    tone->channels = 1;
    tone->sampleRate = sampleRate;
    tone->frames = frames;
    return tone;
}

bool PlayTestTone(AudioEngine& engine) {
    if (!engine.isRunning()) return false;
    // Through the player channel's own setters, so it knows what its voice is set to.
    MixerWaveChannel& player = engine.channels().player();
    player.setFrequency(0);
    player.setLooping(false);
    player.setVolume(0);
    player.setPan(0);
    // Made at the mixer's rate, so it plays without resampling.
    engine.mixer().start(WaveMixer::kPlayerVoice, MakeTestTone(engine.mixer().deviceRate()));
    return true;
}
