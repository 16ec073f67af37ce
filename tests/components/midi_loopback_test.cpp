#include "components/midi/loopback_midi.h"

#include <QTest>
#include <QThread>

#include <gtest/gtest.h>

#include <thread>
#include <vector>

namespace {

ShortMessage Numbered(int i) {
    return {static_cast<std::uint8_t>(0x90 | (i >> 14 & 0x0F)),
            static_cast<std::uint8_t>(i >> 7 & 0x7F), static_cast<std::uint8_t>(i & 0x7F)};
}

std::vector<ShortMessage> Drain(MidiInputPort& port) {
    std::vector<ShortMessage> messages;
    ShortMessage message;
    while (port.queueLength() > 0 && port.head(message)) {
        messages.push_back(message);
        port.removeHead();
    }
    return messages;
}

}  // namespace

// The queue behind every MIDI In port, fed through the loopback port.
TEST(LoopbackMidiInput, FullQueueDropsNewestAndCountsThem) {
    LoopbackMidiInput in({QStringLiteral("Keys")});
    ASSERT_TRUE(in.open(0));
    const int capacity = static_cast<int>(QueuedMidiInput::kQueueCapacity) - 1;
    for (int i = 0; i < capacity + 10; ++i) in.inject(Numbered(i));

    EXPECT_EQ(in.droppedMessages(), 10u);
    const std::vector<ShortMessage> kept = Drain(in);
    ASSERT_EQ(kept.size(), static_cast<std::size_t>(capacity));
    EXPECT_EQ(kept.front(), Numbered(0));
    EXPECT_EQ(kept.back(), Numbered(capacity - 1));

    // Room again once drained; a fresh opening forgets what waited.
    in.inject(Numbered(7));
    EXPECT_EQ(Drain(in), (std::vector<ShortMessage>{Numbered(7)}));
    in.inject(Numbered(8));
    ASSERT_TRUE(in.open(0));
    EXPECT_EQ(in.queueLength(), 0);
}

// The producer is another thread, as a MIDI system's callback is; the reader only ever runs on
// the user-interface thread, woken through the event loop.
TEST(LoopbackMidiInput, MessagesFromAnotherThreadReachTheEventLoopInOrder) {
    LoopbackMidiInput in({QStringLiteral("Keys")});
    ASSERT_TRUE(in.open(0));
    std::vector<ShortMessage> received;
    bool readOffUiThread = false;
    QObject::connect(&in, &MidiInputPort::messagesWaiting, [&] {
        readOffUiThread |= QThread::currentThread() != qApp->thread();
        for (const ShortMessage& message : Drain(in)) received.push_back(message);
    });

    // More than the queue holds, in bursts the reader has to keep up with.
    constexpr int kCount = 20000;
    std::thread producer([&] {
        for (int i = 0; i < kCount; ++i) {
            while (in.queueLength() > 3000) std::this_thread::yield();
            in.inject(Numbered(i));
        }
    });
    const bool arrived = QTest::qWaitFor([&] { return received.size() >= kCount; }, 10000);
    producer.join();
    QCoreApplication::processEvents();

    ASSERT_TRUE(arrived) << received.size() << " of " << kCount;
    EXPECT_EQ(in.droppedMessages(), 0u);
    EXPECT_FALSE(readOffUiThread);
    ASSERT_EQ(received.size(), static_cast<std::size_t>(kCount));
    for (int i = 0; i < kCount; ++i) ASSERT_EQ(received[i], Numbered(i)) << "message " << i;
}
