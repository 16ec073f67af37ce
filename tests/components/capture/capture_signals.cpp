#include "capture_signals.h"

#include <QFile>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <numbers>

std::vector<float> Sine(double hertz, int rate, std::int64_t frames,
                        std::vector<float> amplitudes) {
    const auto channels = amplitudes.size();
    std::vector<float> samples(static_cast<std::size_t>(frames) * channels);
    for (std::int64_t f = 0; f < frames; ++f) {
        const double value = std::sin(2 * std::numbers::pi * hertz * double(f) / rate);
        for (std::size_t c = 0; c < channels; ++c)
            samples[f * channels + c] = static_cast<float>(amplitudes[c] * value);
    }
    return samples;
}

DeviceFeeder::DeviceFeeder(OfflineAudioDevice& device, std::vector<float> samples, bool realTime)
    : samples_(std::move(samples)) {
    thread_ = std::thread([this, &device, realTime] {
        const AudioStreamFormat format = device.format();
        const std::size_t period = std::size_t(format.periodFrames) * format.channels;
        const auto periodTime =
            std::chrono::duration<double>(double(format.periodFrames) / format.sampleRate);
        auto due = std::chrono::steady_clock::now();
        for (std::size_t at = 0; at < samples_.size(); at += period) {
            const std::size_t count = std::min(period, samples_.size() - at);
            device.push(samples_.data() + at, static_cast<int>(count / format.channels));
            if (!realTime) continue;
            due += std::chrono::duration_cast<std::chrono::steady_clock::duration>(periodTime);
            std::this_thread::sleep_until(due);
        }
    });
}

std::vector<float> Channel(const ReadWave& wave, int c, long from, long count) {
    std::vector<float> one(static_cast<std::size_t>(std::max(count, 0L)));
    for (long f = 0; f < count; ++f) one[f] = wave.samples[(from + f) * wave.channels + c];
    return one;
}

std::int64_t DeclaredDataBytes(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) return -1;
    const QByteArray bytes = file.read(4096);
    auto word = [&](qsizetype at) {
        return std::int64_t(quint8(bytes[at])) | std::int64_t(quint8(bytes[at + 1])) << 8 |
               std::int64_t(quint8(bytes[at + 2])) << 16 |
               std::int64_t(quint8(bytes[at + 3])) << 24;
    };
    // RIFF chunks after the 12-byte "RIFF", size, "WAVE" preamble; each is padded to even length.
    for (qsizetype at = 12; at + 8 <= bytes.size(); at += 8 + ((word(at + 4) + 1) & ~1)) {
        if (bytes.mid(at, 4) == "data") return word(at + 4);
    }
    return -1;
}

SineFit FitSine(const std::vector<float>& samples, double hertz, int rate, std::int64_t offset) {
    // Projections on sin and cos; over whole seconds of a few hundred Hz they are orthogonal.
    double s = 0, c = 0;
    const double step = 2 * std::numbers::pi * hertz / rate;
    for (std::size_t n = 0; n < samples.size(); ++n) {
        const double t = step * double(offset + std::int64_t(n));
        s += samples[n] * std::sin(t);
        c += samples[n] * std::cos(t);
    }
    const double scale = 2.0 / double(samples.size());
    SineFit fit;
    fit.amplitude = std::hypot(s, c) * scale;
    fit.phase = std::atan2(c, s);
    double residual = 0;
    for (std::size_t n = 0; n < samples.size(); ++n) {
        const double t = step * double(offset + std::int64_t(n));
        const double error = samples[n] - fit.amplitude * std::sin(t + fit.phase);
        residual += error * error;
    }
    fit.residualRms = std::sqrt(residual / double(samples.size()));
    return fit;
}

double Rms(const std::vector<float>& samples) {
    double sum = 0;
    for (float v : samples) sum += double(v) * v;
    return samples.empty() ? 0.0 : std::sqrt(sum / double(samples.size()));
}
