#include "components/audio/capture/wave_file_writer.h"

#include <sndfile.h>

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstring>

namespace {

constexpr int kBlockFrames = 8192;
// How often the header and the data reach the disk. A killed recording loses what came after:
// this interval, the poll and the frames still queued stay well within half a second.
constexpr auto kDurableInterval = std::chrono::milliseconds(250);
// The queue holds seconds; looking at it a hundred times a second keeps it nearly empty.
constexpr auto kPollInterval = std::chrono::milliseconds(10);

QString SystemError(int error) {
    return QString::fromLocal8Bit(std::strerror(error));
}

}  // namespace

bool WaveFileWriter::start(const QString& path, int channels, int rate, SampleRing& queue,
                           FailureHandler onFailure) {
    close();
    errorText_.clear();
    path_ = path;
    channels_ = channels;
    descriptor_ =
        ::open(path.toLocal8Bit().constData(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    if (descriptor_ < 0) {
        errorText_ = QStringLiteral("Cannot create %1: %2").arg(path, SystemError(errno));
        return false;
    }
    SF_INFO info{};
    info.samplerate = rate;
    info.channels = channels;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    file_ = sf_open_fd(descriptor_, SFM_WRITE, &info, SF_FALSE);
    if (!file_) {
        errorText_ = QStringLiteral("Cannot create %1: %2").arg(path, sf_strerror(nullptr));
        ::close(descriptor_);
        descriptor_ = -1;
        return false;
    }
    // Overs are clipped rather than wrapped around.
    sf_command(file_, SFC_SET_CLIPPING, nullptr, SF_TRUE);
    queue_ = &queue;
    onFailure_ = std::move(onFailure);
    block_.assign(static_cast<std::size_t>(kBlockFrames) * channels, 0.0f);
    framesWritten_ = 0;
    stopping_ = false;
    thread_ = std::thread([this] { run(); });
    return true;
}

void WaveFileWriter::close() {
    if (!file_) return;
    stopping_.store(true, std::memory_order_release);
    thread_.join();
    sf_close(file_);
    file_ = nullptr;
    ::close(descriptor_);
    descriptor_ = -1;
}

void WaveFileWriter::run() {
    auto lastDurable = std::chrono::steady_clock::now();
    for (;;) {
        // Whatever was queued before close() asked to stop is written by the drain below.
        const bool last = stopping_.load(std::memory_order_acquire);
        if (!drain()) return;
        const auto now = std::chrono::steady_clock::now();
        if (last || now - lastDurable >= kDurableInterval) {
            if (!makeDurable()) return;
            lastDurable = now;
        }
        if (last) return;
        std::this_thread::sleep_for(kPollInterval);
    }
}

bool WaveFileWriter::drain() {
    for (;;) {
        const std::size_t samples = queue_->read(block_.data(), block_.size(), channels_);
        if (samples == 0) return true;
        const sf_count_t frames = static_cast<sf_count_t>(samples / channels_);
        errno = 0;
        if (sf_writef_float(file_, block_.data(), frames) != frames) {
            fail(errno == ENOSPC
                     ? QStringLiteral("The disk is full.")
                     : QStringLiteral("Writing %1 failed: %2").arg(path_, sf_strerror(file_)));
            return false;
        }
        framesWritten_.fetch_add(frames, std::memory_order_relaxed);
    }
}

bool WaveFileWriter::makeDurable() {
    sf_command(file_, SFC_UPDATE_HEADER_NOW, nullptr, 0);
    if (::fdatasync(descriptor_) != 0 && errno != EINVAL) {
        fail(QStringLiteral("Writing %1 failed: %2").arg(path_, SystemError(errno)));
        return false;
    }
    return true;
}

void WaveFileWriter::fail(const QString& reason) {
    if (onFailure_) onFailure_(reason);
}
