#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <type_traits>

// A bounded single-producer/single-consumer queue. The producer (a MIDI or audio thread) and the
// consumer (the user-interface thread) never wait on each other and nothing is allocated after
// construction. Capacity must be a power of two; one slot stays free to tell full from empty.
template <typename T, std::size_t Capacity>
class SpscQueue {
    static_assert(Capacity >= 2 && (Capacity & (Capacity - 1)) == 0, "capacity: a power of two");
    static_assert(std::is_trivially_copyable_v<T>, "items are copied without locks");

  public:
    // Producer side. False when the queue is full; the item is then dropped by the caller.
    bool push(const T& item) {
        const std::size_t tail = tail_.load(std::memory_order_relaxed);
        const std::size_t next = (tail + 1) & (Capacity - 1);
        if (next == head_.load(std::memory_order_acquire)) return false;
        items_[tail] = item;
        tail_.store(next, std::memory_order_release);
        return true;
    }

    // Consumer side.
    bool front(T& item) const {
        const std::size_t head = head_.load(std::memory_order_relaxed);
        if (head == tail_.load(std::memory_order_acquire)) return false;
        item = items_[head];
        return true;
    }
    void pop() {
        const std::size_t head = head_.load(std::memory_order_relaxed);
        if (head == tail_.load(std::memory_order_acquire)) return;
        head_.store((head + 1) & (Capacity - 1), std::memory_order_release);
    }
    std::size_t size() const {
        const std::size_t tail = tail_.load(std::memory_order_acquire);
        const std::size_t head = head_.load(std::memory_order_acquire);
        return (tail - head) & (Capacity - 1);
    }
    // Consumer side only: forget everything waiting.
    void clear() { head_.store(tail_.load(std::memory_order_acquire), std::memory_order_release); }

  private:
    std::array<T, Capacity> items_{};
    alignas(64) std::atomic<std::size_t> head_{0};
    alignas(64) std::atomic<std::size_t> tail_{0};
};
