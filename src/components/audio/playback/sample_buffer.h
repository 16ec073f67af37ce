#pragma once

#include <QString>

#include <cstdint>
#include <cstdlib>
#include <functional>
#include <memory>
#include <vector>

// Memory for whole sounds: large blocks are aligned for huge pages and marked for them, which
// spares a ten-second sound some two thousand page faults when it loads and keeps the mixer's
// reads within few pages.
template <typename T>
struct SoundMemoryAllocator {
    using value_type = T;
    static constexpr std::size_t kHugePage = std::size_t{2} << 20;

    SoundMemoryAllocator() = default;
    template <typename U>
    SoundMemoryAllocator(const SoundMemoryAllocator<U>&) {}

    T* allocate(std::size_t count) {
        const std::size_t bytes = count * sizeof(T);
        if (bytes < kHugePage) return std::allocator<T>().allocate(count);
        return static_cast<T*>(AllocateHuge(bytes));
    }
    void deallocate(T* pointer, std::size_t count) {
        if (count * sizeof(T) < kHugePage) {
            std::allocator<T>().deallocate(pointer, count);
        } else {
            std::free(pointer);
        }
    }
    template <typename U>
    bool operator==(const SoundMemoryAllocator<U>&) const {
        return true;
    }

  private:
    static void* AllocateHuge(std::size_t bytes);
};

// A whole sound decoded to float, mono or stereo at the file's own rate. Immutable once made,
// so the audio thread reads it without locks; it is freed on the user-interface thread.
struct SampleBuffer {
    std::vector<float, SoundMemoryAllocator<float>> samples;  // interleaved
    int channels = 1;  // 1 or 2 (files with more keep their first two)
    int sampleRate = 44100;
    std::int64_t frames = 0;
    QString path;
};

// The most samples a decoded sound may hold: 1 GiB of floats, some 46 minutes of stereo at 48 kHz.
// A longer file is refused rather than left to exhaust the memory.
inline constexpr std::int64_t kMostSoundSamples =
    (std::int64_t{1} << 30) / std::int64_t{sizeof(float)};

struct LoadedSamples {
    std::shared_ptr<const SampleBuffer> buffer;
    QString error;  // why it could not be loaded, naming the file, when buffer is null
};

// Told how far a decode has come, 0..100, after every block; returning false abandons it.
using DecodeProgress = std::function<bool(int percent)>;

// Decodes WAV, AIFF, FLAC, Ogg and MP3 with libsndfile. Runs on the calling thread. A file
// without a single frame, one longer than kMostSoundSamples and one that does not fit in the
// memory left are refused.
LoadedSamples LoadSampleFile(const QString& path, const DecodeProgress& progress = {});
