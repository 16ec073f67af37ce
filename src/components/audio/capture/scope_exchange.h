#pragma once

#include <array>
#include <atomic>

// The latest block of recorded samples for the oscilloscope and the spectrum: interleaved,
// `channels` (1 or 2) samples per frame at the take's rate.
struct ScopeBlock {
    static constexpr int kFrames = 1024;
    int frames = 0;
    int channels = 1;
    std::array<float, kFrames * 2> samples{};
};

// Hands whole blocks from the capture callback to the user-interface thread without waiting: a
// triple buffer in which each side owns one block and they swap the third through one atomic.
class ScopeExchange {
  public:
    // Producer side: the block to fill, then publish() to hand it over.
    ScopeBlock& back() { return blocks_[back_]; }
    void publish() noexcept {
        back_ = middle_.exchange(back_ | kFresh, std::memory_order_acq_rel) & kIndex;
    }

    // Only while no producer runs: back to no block at all.
    void clear() {
        for (ScopeBlock& block : blocks_) block.frames = 0;
        middle_.store(middle_.load() & kIndex);
    }

    // Consumer side: the latest block published (an empty one before the first).
    const ScopeBlock& latest() {
        if (middle_.load(std::memory_order_relaxed) & kFresh)
            front_ = middle_.exchange(front_, std::memory_order_acq_rel) & kIndex;
        return blocks_[front_];
    }

  private:
    static constexpr int kIndex = 3;
    static constexpr int kFresh = 4;

    std::array<ScopeBlock, 3> blocks_{};
    int back_ = 0;
    int front_ = 1;
    std::atomic<int> middle_{2};
};
