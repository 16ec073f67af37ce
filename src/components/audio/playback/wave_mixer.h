#pragma once

#include "components/audio/devices/audio_device.h"
#include "components/audio/playback/sample_buffer.h"
#include "components/lockfree/spsc_queue.h"

#include <array>
#include <atomic>
#include <cstdint>
#include <memory>
#include <vector>

// Sixteen pad voices and the editor's player, mixed into one stereo stream at the device's rate.
// The user-interface thread starts and stops voices through a lock-free queue and sets their
// volume, pan, rate and looping through atomics; the audio thread renders every live trigger on
// the next period it is asked for and reports back, through a second queue, the sounds that
// ended and the buffers it no longer reads, which the user-interface thread then frees.
class WaveMixer : public AudioRenderer {
  public:
    static constexpr int kVoices = 17;
    static constexpr int kPlayerVoice = 16;

    explicit WaveMixer(int deviceRate = 48000);
    ~WaveMixer() override;

    // User-interface thread. Only while no device renders: the rate of the stream to come.
    void setDeviceRate(int hertz);
    int deviceRate() const { return deviceRate_; }

    void start(int voice, std::shared_ptr<const SampleBuffer> buffer);
    void stop(int voice);
    // 0 plays at the file's own rate; otherwise the file plays at this rate.
    void setRate(int voice, int hertz);
    void setLooping(int voice, bool looping);
    // Hundredths of a decibel (0 = full level) and -10000 (left)..10000 (right).
    void setVolumeAndPan(int voice, int volume, int pan);

    // Takes what the audio thread reported; calls onEnded(voice) for each sound that ended by
    // itself and still belongs to the latest start of that voice.
    template <typename OnEnded>
    void collectEvents(OnEnded&& onEnded);

    // The voice's output peaks over the last period, 0..1.
    float peakLeft(int voice) const { return peaks_[voice].left.load(std::memory_order_relaxed); }
    float peakRight(int voice) const { return peaks_[voice].right.load(std::memory_order_relaxed); }

    // Only while no device renders: forget every sound and free the buffers.
    void resetWhileStopped();

    // Audio thread.
    void render(float* stereo, int frames) noexcept override;

    // The gains a volume and pan give each side.
    static void Gains(int volume, int pan, float& left, float& right);

  private:
    struct Command {
        enum Kind : std::uint8_t { Start, Stop } kind;
        std::uint8_t voice;
        std::uint32_t startId;
        const SampleBuffer* buffer;
    };
    struct Event {
        enum Kind : std::uint8_t { Ended, Released } kind;
        std::uint8_t voice;
        std::uint32_t startId;
        const SampleBuffer* buffer;
    };
    struct Controls {
        std::atomic<float> gainLeft{1.0f};
        std::atomic<float> gainRight{1.0f};
        std::atomic<int> rate{0};
        std::atomic<bool> looping{false};
    };
    struct Peaks {
        std::atomic<float> left{0.0f};
        std::atomic<float> right{0.0f};
    };
    // A sound being played: the voice's current one, or the tail of the previous one fading out.
    struct Sound {
        const SampleBuffer* buffer = nullptr;
        std::uint64_t position = 0;  // frames, 32.32 fixed point
        std::uint32_t startId = 0;
        int fadeIn = 0;   // frames of fade-in still to go
        int fadeOut = 0;  // frames of fade-out still to go (tails only)
        float gainLeft = 0.0f, gainRight = 0.0f;
    };
    struct VoiceState {
        Sound current;
        Sound tail;
    };

    void ApplyCommand(const Command& command) noexcept;
    void Release(int voice, Sound& sound) noexcept;
    void RenderVoice(int voice, float* stereo, int frames) noexcept;
    // Adds the sound into the mix; false when a non-looped sound reached its end.
    bool RenderSound(Sound& sound, std::uint64_t step, bool looping, float targetLeft,
                     float targetRight, bool fadingOut, float* stereo, int frames, float& peakL,
                     float& peakR) noexcept;
    // How far one device frame moves through the sound, 32.32 fixed point.
    std::uint64_t Step(const Sound& sound, int rate) const noexcept;
    void Report(const Event& event) noexcept;

    int deviceRate_;
    int fadeInFrames_ = 48;
    int fadeOutFrames_ = 96;
    std::array<Controls, kVoices> controls_;
    std::array<Peaks, kVoices> peaks_;
    std::array<VoiceState, kVoices> voices_;  // audio thread only
    SpscQueue<Command, 1024> commands_;
    SpscQueue<Event, 4096> events_;

    // User-interface thread: the buffers the audio thread may still read, and the latest start.
    std::array<std::vector<std::shared_ptr<const SampleBuffer>>, kVoices> held_;
    std::array<std::uint32_t, kVoices> latestStart_{};
};

template <typename OnEnded>
void WaveMixer::collectEvents(OnEnded&& onEnded) {
    Event event{};
    while (events_.front(event)) {
        events_.pop();
        auto& held = held_[event.voice];
        if (event.kind == Event::Released) {
            for (auto it = held.begin(); it != held.end(); ++it) {
                if (it->get() == event.buffer) {
                    held.erase(it);
                    break;
                }
            }
        } else if (event.startId == latestStart_[event.voice]) {
            onEnded(event.voice);
        }
    }
}
