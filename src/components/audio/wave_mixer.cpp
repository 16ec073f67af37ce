#include "components/audio/wave_mixer.h"

#include <algorithm>
#include <cmath>
#include <cstring>

namespace {

// Four-point, third-order Hermite interpolation between b and c at t in 0..1.
inline float Hermite(float a, float b, float c, float d, float t) {
    const float c1 = 0.5f * (c - a);
    const float c2 = a - 2.5f * b + 2.0f * c - 0.5f * d;
    const float c3 = 0.5f * (d - a) + 1.5f * (b - c);
    return ((c3 * t + c2) * t + c1) * t + b;
}

// One channel's sample at a frame index that may lie outside the sound: looped sounds wrap,
// others are silent before the start and after the end.
inline float SampleAt(const SampleBuffer& buffer, std::int64_t frame, int channel, bool looping) {
    if (frame < 0 || frame >= buffer.frames) {
        if (!looping || buffer.frames == 0) return 0.0f;
        frame %= buffer.frames;
        if (frame < 0) frame += buffer.frames;
    }
    return buffer.samples[static_cast<std::size_t>(frame * buffer.channels + channel)];
}

}  // namespace

WaveMixer::WaveMixer(int deviceRate) : deviceRate_(deviceRate) {
    setDeviceRate(deviceRate);
}

WaveMixer::~WaveMixer() = default;

void WaveMixer::setDeviceRate(int hertz) {
    deviceRate_ = std::max(hertz, 1000);
    // Short ramps keep starts and stops free of clicks: 1 ms in, 2 ms out.
    fadeInFrames_ = std::max(1, deviceRate_ / 1000);
    fadeOutFrames_ = std::max(1, deviceRate_ / 500);
}

void WaveMixer::Gains(int volume, int pan, float& left, float& right) {
    volume = std::clamp(volume, -10000, 0);
    pan = std::clamp(pan, -10000, 10000);
    const float gain = std::pow(10.0f, static_cast<float>(volume) / 2000.0f);
    // The side away from the pan is attenuated by |pan| / 100 dB.
    const float away = std::pow(10.0f, -static_cast<float>(std::abs(pan)) / 2000.0f);
    left = pan > 0 ? gain * away : gain;
    right = pan < 0 ? gain * away : gain;
}

void WaveMixer::start(int voice, std::shared_ptr<const SampleBuffer> buffer) {
    if (voice < 0 || voice >= kVoices || !buffer) return;
    const std::uint32_t id = ++latestStart_[voice];
    const Command command{Command::Start, static_cast<std::uint8_t>(voice), id, buffer.get()};
    held_[voice].push_back(std::move(buffer));
    if (!commands_.push(command)) held_[voice].pop_back();
}

void WaveMixer::stop(int voice) {
    if (voice < 0 || voice >= kVoices) return;
    // A later start has a new id, so an end reported for this one is ignored.
    const std::uint32_t id = ++latestStart_[voice];
    commands_.push(Command{Command::Stop, static_cast<std::uint8_t>(voice), id, nullptr});
}

void WaveMixer::setRate(int voice, int hertz) {
    if (voice >= 0 && voice < kVoices) controls_[voice].rate.store(std::max(hertz, 0));
}

void WaveMixer::setLooping(int voice, bool looping) {
    if (voice >= 0 && voice < kVoices) controls_[voice].looping.store(looping);
}

void WaveMixer::setVolumeAndPan(int voice, int volume, int pan) {
    if (voice < 0 || voice >= kVoices) return;
    float left = 1.0f, right = 1.0f;
    Gains(volume, pan, left, right);
    controls_[voice].gainLeft.store(left);
    controls_[voice].gainRight.store(right);
}

void WaveMixer::resetWhileStopped() {
    commands_.clear();
    Event event{};
    while (events_.front(event)) events_.pop();
    for (int voice = 0; voice < kVoices; ++voice) {
        voices_[voice] = VoiceState{};
        held_[voice].clear();
        peaks_[voice].left.store(0.0f);
        peaks_[voice].right.store(0.0f);
        ++latestStart_[voice];
    }
}

void WaveMixer::Report(const Event& event) noexcept {
    // A full queue loses the report: at worst a buffer is freed only at the next reset.
    events_.push(event);
}

void WaveMixer::Release(int voice, Sound& sound) noexcept {
    if (sound.buffer) {
        Report(
            Event{Event::Released, static_cast<std::uint8_t>(voice), sound.startId, sound.buffer});
    }
    sound = Sound{};
}

void WaveMixer::ApplyCommand(const Command& command) noexcept {
    VoiceState& state = voices_[command.voice];
    if (state.current.buffer) {
        // The sound playing now fades out as a tail; an older tail still fading is cut.
        Release(command.voice, state.tail);
        state.tail = state.current;
        state.tail.fadeOut = fadeOutFrames_;
        state.tail.fadeIn = 0;
        state.current = Sound{};
    }
    if (command.kind == Command::Start) {
        Sound& sound = state.current;
        sound.buffer = command.buffer;
        sound.startId = command.startId;
        sound.position = 0.0;
        sound.fadeIn = fadeInFrames_;
        const Controls& controls = controls_[command.voice];
        sound.gainLeft = controls.gainLeft.load(std::memory_order_relaxed);
        sound.gainRight = controls.gainRight.load(std::memory_order_relaxed);
    }
}

void WaveMixer::render(float* stereo, int frames) noexcept {
    std::memset(stereo, 0, sizeof(float) * 2 * static_cast<std::size_t>(frames));
    Command command{};
    while (commands_.front(command)) {
        commands_.pop();
        ApplyCommand(command);
    }
    for (int voice = 0; voice < kVoices; ++voice) RenderVoice(voice, stereo, frames);
}

void WaveMixer::RenderVoice(int voice, float* stereo, int frames) noexcept {
    VoiceState& state = voices_[voice];
    const Controls& controls = controls_[voice];
    const float targetLeft = controls.gainLeft.load(std::memory_order_relaxed);
    const float targetRight = controls.gainRight.load(std::memory_order_relaxed);
    const int rate = controls.rate.load(std::memory_order_relaxed);
    const bool looping = controls.looping.load(std::memory_order_relaxed);
    float peakL = 0.0f, peakR = 0.0f;

    if (state.tail.buffer) {
        const double step = (rate > 0 ? rate : state.tail.buffer->sampleRate) / double(deviceRate_);
        const bool more = RenderSound(state.tail, step, looping, targetLeft, targetRight, true,
                                      stereo, frames, peakL, peakR);
        if (!more || state.tail.fadeOut <= 0) Release(voice, state.tail);
    }
    if (state.current.buffer) {
        const double step =
            (rate > 0 ? rate : state.current.buffer->sampleRate) / double(deviceRate_);
        if (!RenderSound(state.current, step, looping, targetLeft, targetRight, false, stereo,
                         frames, peakL, peakR)) {
            Report(Event{Event::Ended, static_cast<std::uint8_t>(voice), state.current.startId,
                         state.current.buffer});
            Release(voice, state.current);
        }
    }
    peaks_[voice].left.store(peakL, std::memory_order_relaxed);
    peaks_[voice].right.store(peakR, std::memory_order_relaxed);
}

bool WaveMixer::RenderSound(Sound& sound, double step, bool looping, float targetLeft,
                            float targetRight, bool fadingOut, float* stereo, int frames,
                            float& peakL, float& peakR) noexcept {
    const SampleBuffer& buffer = *sound.buffer;
    const std::int64_t length = buffer.frames;
    const bool stereoFile = buffer.channels == 2;
    const float* data = buffer.samples.data();
    // Volume and pan glide to their new values over the period instead of jumping.
    const float leftStep = (targetLeft - sound.gainLeft) / static_cast<float>(frames);
    const float rightStep = (targetRight - sound.gainRight) / static_cast<float>(frames);
    const float fadeInStep = 1.0f / static_cast<float>(fadeInFrames_);
    const float fadeOutStep = 1.0f / static_cast<float>(fadeOutFrames_);
    double position = sound.position;
    float gainL = sound.gainLeft, gainR = sound.gainRight;
    bool sounding = true;

    for (int i = 0; i < frames; ++i) {
        if (position >= static_cast<double>(length)) {
            if (!looping || length == 0) {
                sounding = false;
                break;
            }
            position -=
                static_cast<double>(length) * std::floor(position / static_cast<double>(length));
        }
        const auto index = static_cast<std::int64_t>(position);
        const auto t = static_cast<float>(position - static_cast<double>(index));
        float left, right;
        if (index >= 1 && index + 2 < length) {  // the common case: all four points inside
            const float* p = data + (index - 1) * buffer.channels;
            const int c = buffer.channels;
            left = Hermite(p[0], p[c], p[2 * c], p[3 * c], t);
            right = stereoFile ? Hermite(p[1], p[c + 1], p[2 * c + 1], p[3 * c + 1], t) : left;
        } else {
            left = Hermite(SampleAt(buffer, index - 1, 0, looping),
                           SampleAt(buffer, index, 0, looping),
                           SampleAt(buffer, index + 1, 0, looping),
                           SampleAt(buffer, index + 2, 0, looping), t);
            right = stereoFile ? Hermite(SampleAt(buffer, index - 1, 1, looping),
                                         SampleAt(buffer, index, 1, looping),
                                         SampleAt(buffer, index + 1, 1, looping),
                                         SampleAt(buffer, index + 2, 1, looping), t)
                               : left;
        }
        float envelope = 1.0f;
        if (sound.fadeIn > 0) {
            // The very first frame already carries sound, so a pad answers without delay.
            --sound.fadeIn;
            envelope = 1.0f - static_cast<float>(sound.fadeIn) * fadeInStep;
        }
        if (fadingOut) {
            if (sound.fadeOut <= 0) break;
            envelope *= static_cast<float>(sound.fadeOut) * fadeOutStep;
            --sound.fadeOut;
        }
        gainL += leftStep;
        gainR += rightStep;
        const float outL = left * gainL * envelope;
        const float outR = right * gainR * envelope;
        stereo[2 * i] += outL;
        stereo[2 * i + 1] += outR;
        peakL = std::max(peakL, std::fabs(outL));
        peakR = std::max(peakR, std::fabs(outR));
        position += step;
    }
    sound.position = position;
    sound.gainLeft = targetLeft;
    sound.gainRight = targetRight;
    return sounding;
}
