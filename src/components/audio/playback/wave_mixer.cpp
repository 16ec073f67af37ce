#include "components/audio/playback/wave_mixer.h"

#include <algorithm>
#include <cmath>
#include <cstring>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

// The hot loop is also built for AVX2 and chosen at load time where the processor has it: the
// VEX encoding avoids the penalties of mixing old SSE code with the AVX code of the C library.
#if defined(__GNUC__) && defined(__x86_64__) && defined(__linux__)
#define OQ_ALSO_FOR_AVX2 __attribute__((target_clones("avx2", "default")))
#else
#define OQ_ALSO_FOR_AVX2
#endif

namespace {

// Four-point, third-order Hermite interpolation between b and c at t in 0..1, in the form that
// needs the fewest operations.
inline float Hermite(float a, float b, float c, float d, float t) {
    const float slope = 0.5f * (c - a);
    const float v = b - c;
    const float w = slope + v;
    const float cubic = w + v + 0.5f * (d - b);
    const float square = w + cubic;
    return ((cubic * t - square) * t + slope) * t + b;
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
        sound.position = 0;
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

std::uint64_t WaveMixer::Step(const Sound& sound, int rate) const noexcept {
    const int playRate = rate > 0 ? rate : sound.buffer->sampleRate;
    return static_cast<std::uint64_t>(std::llround(std::ldexp(double(playRate) / deviceRate_, 32)));
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
        const bool more = RenderSound(state.tail, Step(state.tail, rate), looping, targetLeft,
                                      targetRight, true, stereo, frames, peakL, peakR);
        if (!more || state.tail.fadeOut <= 0) Release(voice, state.tail);
    }
    if (state.current.buffer) {
        if (!RenderSound(state.current, Step(state.current, rate), looping, targetLeft, targetRight,
                         false, stereo, frames, peakL, peakR)) {
            Report(Event{Event::Ended, static_cast<std::uint8_t>(voice), state.current.startId,
                         state.current.buffer});
            Release(voice, state.current);
        }
    }
    peaks_[voice].left.store(peakL, std::memory_order_relaxed);
    peaks_[voice].right.store(peakR, std::memory_order_relaxed);
}

namespace {

constexpr std::uint64_t kOne = std::uint64_t{1} << 32;
// The fraction between two frames, from the top 24 bits below the point: exact in a float and a
// signed conversion, which is one instruction where an unsigned 64-bit one is several.
inline float Fraction(std::uint64_t position) {
    return static_cast<float>(static_cast<std::int32_t>((position >> 8) & 0xFFFFFF)) *
           (1.0f / 16777216.0f);
}

#if defined(__SSE2__)
// Hermite interpolation of four lanes at once: the same operations as Hermite() above.
inline __m128 Hermite4(__m128 a, __m128 b, __m128 c, __m128 d, __m128 t) {
    const __m128 half = _mm_set1_ps(0.5f);
    const __m128 slope = _mm_mul_ps(half, _mm_sub_ps(c, a));
    const __m128 v = _mm_sub_ps(b, c);
    const __m128 w = _mm_add_ps(slope, v);
    const __m128 cubic = _mm_add_ps(_mm_add_ps(w, v), _mm_mul_ps(half, _mm_sub_ps(d, b)));
    const __m128 square = _mm_add_ps(w, cubic);
    return _mm_add_ps(
        _mm_mul_ps(_mm_add_ps(_mm_mul_ps(_mm_sub_ps(_mm_mul_ps(cubic, t), square), t), slope), t),
        b);
}

// The stereo inner loop, two frames at a time: left and right of both frames side by side in
// one vector.
OQ_ALSO_FOR_AVX2 void RenderPlainStereo(const float* data, std::uint64_t& position,
                                        std::uint64_t step, int frames, float& gainL, float& gainR,
                                        float leftStep, float rightStep, float* out, float& peakL,
                                        float& peakR) noexcept {
    const __m128 signMask = _mm_castsi128_ps(_mm_set1_epi32(0x7fffffff));
    const __m128 gainStep = _mm_setr_ps(2 * leftStep, 2 * rightStep, 2 * leftStep, 2 * rightStep);
    __m128 gain = _mm_setr_ps(gainL + leftStep, gainR + rightStep, gainL + 2 * leftStep,
                              gainR + 2 * rightStep);
    __m128 peak = _mm_setr_ps(peakL, peakR, peakL, peakR);
    int i = 0;
    for (; i + 1 < frames; i += 2) {
        const std::uint64_t next = position + step;
        // Frame k reads points a b | c d from p and p + 4; so does frame k + 1 from q.
        const float* p = data + ((position >> 32) - 1) * 2;
        const float* q = data + ((next >> 32) - 1) * 2;
        const __m128 p01 = _mm_loadu_ps(p), p23 = _mm_loadu_ps(p + 4);
        const __m128 q01 = _mm_loadu_ps(q), q23 = _mm_loadu_ps(q + 4);
        const __m128 a = _mm_movelh_ps(p01, q01);
        const __m128 b = _mm_movehl_ps(q01, p01);
        const __m128 c = _mm_movelh_ps(p23, q23);
        const __m128 d = _mm_movehl_ps(q23, p23);
        const float tp = Fraction(position), tq = Fraction(next);
        const __m128 t = _mm_setr_ps(tp, tp, tq, tq);
        const __m128 sample = _mm_mul_ps(Hermite4(a, b, c, d, t), gain);
        float* o = out + 2 * i;
        _mm_storeu_ps(o, _mm_add_ps(_mm_loadu_ps(o), sample));
        peak = _mm_max_ps(peak, _mm_and_ps(sample, signMask));
        gain = _mm_add_ps(gain, gainStep);
        position = next + step;
    }
    alignas(16) float lanes[4];
    _mm_store_ps(lanes, peak);
    peakL = std::max(lanes[0], lanes[2]);
    peakR = std::max(lanes[1], lanes[3]);
    _mm_store_ps(lanes, gain);
    gainL = lanes[0] - leftStep;  // the gain of the last frame rendered
    gainR = lanes[1] - rightStep;
    if (i < frames) {  // an odd frame left over
        const float* p = data + ((position >> 32) - 1) * 2;
        const float t = Fraction(position);
        const float left = Hermite(p[0], p[2], p[4], p[6], t);
        const float right = Hermite(p[1], p[3], p[5], p[7], t);
        gainL += leftStep;
        gainR += rightStep;
        out[2 * i] += left * gainL;
        out[2 * i + 1] += right * gainR;
        peakL = std::max(peakL, std::fabs(left * gainL));
        peakR = std::max(peakR, std::fabs(right * gainR));
        position += step;
    }
}
#endif

// The inner loop where nothing needs checking: all four points inside the sound, no fade.
template <int Channels>
void RenderPlain(const float* data, std::uint64_t& position, std::uint64_t step, int frames,
                 float& gainL, float& gainR, float leftStep, float rightStep, float* out,
                 float& peakL, float& peakR) noexcept {
    for (int i = 0; i < frames; ++i) {
        const std::uint64_t index = position >> 32;
        const float t = Fraction(position);
        const float* p = data + (index - 1) * Channels;
        const float left = Hermite(p[0], p[Channels], p[2 * Channels], p[3 * Channels], t);
        const float right = Channels == 2 ? Hermite(p[1], p[Channels + 1], p[2 * Channels + 1],
                                                    p[3 * Channels + 1], t)
                                          : left;
        gainL += leftStep;
        gainR += rightStep;
        const float outL = left * gainL;
        const float outR = right * gainR;
        out[2 * i] += outL;
        out[2 * i + 1] += outR;
        peakL = std::max(peakL, std::fabs(outL));
        peakR = std::max(peakR, std::fabs(outR));
        position += step;
    }
}

}  // namespace

bool WaveMixer::RenderSound(Sound& sound, std::uint64_t step, bool looping, float targetLeft,
                            float targetRight, bool fadingOut, float* stereo, int frames,
                            float& peakL, float& peakR) noexcept {
    const SampleBuffer& buffer = *sound.buffer;
    const std::int64_t length = buffer.frames;
    const std::uint64_t end = static_cast<std::uint64_t>(length) << 32;
    // The last position from which the four interpolation points all lie inside the sound.
    const std::uint64_t plainEnd = length >= 3 ? static_cast<std::uint64_t>(length - 2) << 32 : 0;
    const bool stereoFile = buffer.channels == 2;
    const float* data = buffer.samples.data();
    // Volume and pan glide to their new values over the period instead of jumping.
    const float leftStep = (targetLeft - sound.gainLeft) / static_cast<float>(frames);
    const float rightStep = (targetRight - sound.gainRight) / static_cast<float>(frames);
    const float fadeInStep = 1.0f / static_cast<float>(fadeInFrames_);
    const float fadeOutStep = 1.0f / static_cast<float>(fadeOutFrames_);
    std::uint64_t position = sound.position;
    float gainL = sound.gainLeft, gainR = sound.gainRight;
    bool sounding = true;

    for (int i = 0; i < frames;) {
        if (position >= end) {
            if (!looping || length == 0) {
                sounding = false;
                break;
            }
            position %= end;
        }
        const bool fading = sound.fadeIn > 0 || fadingOut;
        if (!fading && position >= kOne && position < plainEnd) {
            const std::uint64_t run = (plainEnd - position + step - 1) / step;
            const int count = static_cast<int>(std::min<std::uint64_t>(run, frames - i));
            if (stereoFile) {
#if defined(__SSE2__)
                RenderPlainStereo(
#else
                RenderPlain<2>(
#endif
                    data, position, step, count, gainL, gainR, leftStep, rightStep, stereo + 2 * i,
                    peakL, peakR);
            } else {
                RenderPlain<1>(data, position, step, count, gainL, gainR, leftStep, rightStep,
                               stereo + 2 * i, peakL, peakR);
            }
            i += count;
            continue;
        }

        // One frame the careful way: at the edges of the sound, across a loop, or fading.
        const auto index = static_cast<std::int64_t>(position >> 32);
        const float t = Fraction(position);
        const float left = Hermite(
            SampleAt(buffer, index - 1, 0, looping), SampleAt(buffer, index, 0, looping),
            SampleAt(buffer, index + 1, 0, looping), SampleAt(buffer, index + 2, 0, looping), t);
        const float right = stereoFile ? Hermite(SampleAt(buffer, index - 1, 1, looping),
                                                 SampleAt(buffer, index, 1, looping),
                                                 SampleAt(buffer, index + 1, 1, looping),
                                                 SampleAt(buffer, index + 2, 1, looping), t)
                                       : left;
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
        ++i;
    }
    sound.position = position;
    sound.gainLeft = targetLeft;
    sound.gainRight = targetRight;
    return sounding;
}
