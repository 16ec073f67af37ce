#pragma once

#include <atomic>
#include <cstddef>
#include <memory>

// A bounded single-producer/single-consumer ring of float samples, written by the capture
// callback and read by the file writer in blocks. Its storage is allocated and touched once, up
// front, so that the callback never faults a fresh page in. Capacity is a power of two.
class SampleRing {
  public:
    explicit SampleRing(std::size_t capacity);

    std::size_t capacity() const { return capacity_; }

    // Producer side: copies as many whole groups of `group` samples as fit; returns how many
    // samples were copied.
    std::size_t write(const float* samples, std::size_t count, std::size_t group) noexcept;

    // Consumer side: copies up to `count` samples out, in whole groups of `group`.
    std::size_t read(float* samples, std::size_t count, std::size_t group) noexcept;
    std::size_t available() const noexcept;
    // Consumer side, only while no producer runs: forget everything waiting.
    void clear() noexcept { head_.store(tail_.load(std::memory_order_acquire)); }

  private:
    std::size_t capacity_;
    std::unique_ptr<float[]> samples_;
    // Running counts of samples read and written; their difference is the fill.
    alignas(64) std::atomic<std::size_t> head_{0};
    alignas(64) std::atomic<std::size_t> tail_{0};
};
