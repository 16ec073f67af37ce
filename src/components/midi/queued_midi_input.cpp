#include "components/midi/queued_midi_input.h"

#include <QSocketNotifier>

#include <fcntl.h>
#include <unistd.h>

namespace {

void MakeNonBlocking(int fd) {
    ::fcntl(fd, F_SETFL, ::fcntl(fd, F_GETFL) | O_NONBLOCK);
    ::fcntl(fd, F_SETFD, FD_CLOEXEC);
}

}  // namespace

QueuedMidiInput::QueuedMidiInput(QObject* parent) : MidiInputPort(parent) {
    if (::pipe(wakeUpPipe_) != 0) return;
    MakeNonBlocking(wakeUpPipe_[0]);
    MakeNonBlocking(wakeUpPipe_[1]);
    notifier_ = new QSocketNotifier(wakeUpPipe_[0], QSocketNotifier::Read, this);
    connect(notifier_, &QSocketNotifier::activated, this, &QueuedMidiInput::onWakeUp);
}

QueuedMidiInput::~QueuedMidiInput() {
    delete notifier_;
    for (int fd : wakeUpPipe_) {
        if (fd >= 0) ::close(fd);
    }
}

int QueuedMidiInput::queueLength() const {
    return static_cast<int>(queue_.size());
}

bool QueuedMidiInput::head(ShortMessage& message) const {
    return queue_.front(message);
}

void QueuedMidiInput::removeHead() {
    queue_.pop();
}

void QueuedMidiInput::deliver(const ShortMessage& message) {
    if (!queue_.push(message)) {
        dropped_.fetch_add(1, std::memory_order_relaxed);
        return;
    }
    // One byte per batch: the reader clears the flag before it drains the queue.
    if (!wakeUpPending_.exchange(true, std::memory_order_acq_rel)) {
        const char byte = 1;
        [[maybe_unused]] const ssize_t written = ::write(wakeUpPipe_[1], &byte, 1);
    }
}

void QueuedMidiInput::onWakeUp() {
    char bytes[64];
    while (::read(wakeUpPipe_[0], bytes, sizeof bytes) > 0) {
    }
    // Clearing with an exchange makes every message queued before the producer's flag visible.
    wakeUpPending_.exchange(false, std::memory_order_acq_rel);
    if (queueLength() > 0) emit messagesWaiting();
}
