#include "components/audio/capture/sample_ring.h"

#include <algorithm>
#include <cassert>
#include <cstring>

namespace {

// Copies `count` samples between the ring and a flat buffer, in at most two pieces.
void CopyIn(float* ring, std::size_t capacity, std::size_t at, const float* from,
            std::size_t count) {
    const std::size_t first = std::min(count, capacity - at);
    std::memcpy(ring + at, from, first * sizeof(float));
    std::memcpy(ring, from + first, (count - first) * sizeof(float));
}

void CopyOut(const float* ring, std::size_t capacity, std::size_t at, float* to,
             std::size_t count) {
    const std::size_t first = std::min(count, capacity - at);
    std::memcpy(to, ring + at, first * sizeof(float));
    std::memcpy(to + first, ring, (count - first) * sizeof(float));
}

}  // namespace

SampleRing::SampleRing(std::size_t capacity) : capacity_(capacity), samples_(new float[capacity]) {
    assert(capacity >= 2 && (capacity & (capacity - 1)) == 0);
    std::fill_n(samples_.get(), capacity_, 0.0f);
}

std::size_t SampleRing::write(const float* samples, std::size_t count, std::size_t group) noexcept {
    const std::size_t tail = tail_.load(std::memory_order_relaxed);
    const std::size_t room = capacity_ - (tail - head_.load(std::memory_order_acquire));
    const std::size_t n = std::min(count, room) / group * group;
    CopyIn(samples_.get(), capacity_, tail & (capacity_ - 1), samples, n);
    tail_.store(tail + n, std::memory_order_release);
    return n;
}

std::size_t SampleRing::read(float* samples, std::size_t count, std::size_t group) noexcept {
    const std::size_t head = head_.load(std::memory_order_relaxed);
    const std::size_t waiting = tail_.load(std::memory_order_acquire) - head;
    const std::size_t n = std::min(count, waiting) / group * group;
    CopyOut(samples_.get(), capacity_, head & (capacity_ - 1), samples, n);
    head_.store(head + n, std::memory_order_release);
    return n;
}

std::size_t SampleRing::available() const noexcept {
    return tail_.load(std::memory_order_acquire) - head_.load(std::memory_order_acquire);
}
