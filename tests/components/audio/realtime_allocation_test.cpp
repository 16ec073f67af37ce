// The audio callback must never allocate or free: every operator new and delete made on a
// thread that is rendering is counted.
#include "components/audio/engine_wave_channels.h"
#include "components/audio/offline_audio_device.h"
#include "support/wave_files.h"

#include <QCoreApplication>
#include <QTemporaryDir>

#include <gtest/gtest.h>

#include <atomic>
#include <cstdlib>
#include <new>
#include <thread>

namespace {
thread_local bool tlRendering = false;
std::atomic<int> allocationsWhileRendering{0};
std::atomic<int> freesWhileRendering{0};

void* Allocate(std::size_t size) {
    if (tlRendering) ++allocationsWhileRendering;
    if (void* p = std::malloc(size ? size : 1)) return p;
    throw std::bad_alloc();
}
void Free(void* p) noexcept {
    if (p && tlRendering) ++freesWhileRendering;
    std::free(p);
}
}  // namespace

void* operator new(std::size_t size) {
    return Allocate(size);
}
void* operator new[](std::size_t size) {
    return Allocate(size);
}
void operator delete(void* p) noexcept {
    Free(p);
}
void operator delete[](void* p) noexcept {
    Free(p);
}
void operator delete(void* p, std::size_t) noexcept {
    Free(p);
}
void operator delete[](void* p, std::size_t) noexcept {
    Free(p);
}

namespace {

// Renders periods on its own thread, as a sound card's callback thread would.
class RenderThread {
  public:
    explicit RenderThread(WaveMixer& mixer)
        : thread_([this, &mixer] {
              std::vector<float> period(2 * 256);
              while (!done_.load()) {
                  tlRendering = true;
                  mixer.render(period.data(), 256);
                  tlRendering = false;
                  periods_.fetch_add(1);
              }
          }) {}
    ~RenderThread() {
        done_.store(true);
        thread_.join();
    }
    // Waits until the audio thread has rendered a few more periods.
    void Advance(int periods = 3) {
        const int target = periods_.load() + periods;
        while (periods_.load() < target) std::this_thread::yield();
    }

  private:
    std::atomic<bool> done_{false};
    std::atomic<int> periods_{0};
    std::thread thread_;
};

}  // namespace

TEST(RealtimeAllocation, SixteenChannelsStartLoopChangeRateAndStopWithoutAllocating) {
    // Sanity: the counter sees allocations on a flagged thread.
    tlRendering = true;
    ::operator delete(::operator new(16));  // a direct call, which the compiler cannot elide
    tlRendering = false;
    ASSERT_EQ(allocationsWhileRendering.exchange(0), 1);
    ASSERT_EQ(freesWhileRendering.exchange(0), 1);

    QTemporaryDir dir;
    WaveMixer mixer(48000);
    EngineWaveChannels channels(mixer);
    for (int note = 57; note <= 72; ++note) {
        const QString path = dir.filePath(QStringLiteral("pad%1.wav").arg(note));
        ASSERT_TRUE(WriteTestWave(path, 22050 + 1000 * (note - 57), note % 2 + 1, 3000,
                                  [note](long f, int) { return 0.01f * ((f * note) % 100); }));
        ASSERT_TRUE(channels.channel(note).setFileName(path));
    }
    {
        RenderThread audio(mixer);
        for (int round = 0; round < 20; ++round) {
            for (int note = 57; note <= 72; ++note) {
                MixerWaveChannel& channel = channels.channel(note);
                channel.setLooping(round % 3 != 0);
                channel.setFrequency(round % 2 ? 8000 + 3000 * (note - 57) : 0);
                channel.setVolume(-100 * round);
                channel.setPan(1000 * (note - 64));
                channel.start();  // a restart while sounding: the old sound fades out as a tail
            }
            audio.Advance();
            if (round % 4 == 3) {
                for (int note = 57; note <= 72; ++note) channels.channel(note).stop();
            }
            audio.Advance();
            channels.collectEvents();  // frees released sounds here, not on the audio thread
        }
        for (int note = 57; note <= 72; ++note) channels.channel(note).close();
        audio.Advance(10);
    }
    channels.collectEvents();
    EXPECT_EQ(allocationsWhileRendering.load(), 0);
    EXPECT_EQ(freesWhileRendering.load(), 0);
}
