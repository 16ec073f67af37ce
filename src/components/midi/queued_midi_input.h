#pragma once

#include "components/lockfree/spsc_queue.h"
#include "components/midi/midi_port.h"

#include <atomic>
#include <cstdint>

class QSocketNotifier;

// The part every MIDI In backend shares: a bounded queue that the backend's own thread fills
// and the user-interface thread drains, and a wake-up of the user-interface thread that never
// allocates or locks on the producer's side (an atomic flag plus one byte down a pipe).
class QueuedMidiInput : public MidiInputPort {
    Q_OBJECT
  public:
    static constexpr std::size_t kQueueCapacity = 4096;

    explicit QueuedMidiInput(QObject* parent = nullptr);
    ~QueuedMidiInput() override;

    int queueLength() const override;
    bool head(ShortMessage& message) const override;
    void removeHead() override;

    // Messages lost because the queue was full.
    std::uint64_t droppedMessages() const { return dropped_.load(std::memory_order_relaxed); }

  protected:
    // Producer side, safe on a real-time thread: queues the message and wakes the reader.
    void deliver(const ShortMessage& message);
    // User-interface side: forgets whatever an earlier opening left waiting.
    void discardWaiting() { queue_.clear(); }

  private:
    void onWakeUp();

    SpscQueue<ShortMessage, kQueueCapacity> queue_;
    std::atomic<bool> wakeUpPending_{false};
    std::atomic<std::uint64_t> dropped_{0};
    int wakeUpPipe_[2] = {-1, -1};
    QSocketNotifier* notifier_ = nullptr;
};
