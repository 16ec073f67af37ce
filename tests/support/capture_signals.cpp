#include "support/capture_signals.h"

#include <QFile>
#include <QtEndian>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <numbers>
#include <thread>

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

void Feed(OfflineAudioDevice& device, const std::vector<float>& samples, bool realTime) {
    std::thread([&] {
        const AudioStreamFormat format = device.format();
        const std::size_t period = std::size_t(format.periodFrames) * format.channels;
        const auto periodTime =
            std::chrono::duration<double>(double(format.periodFrames) / format.sampleRate);
        auto due = std::chrono::steady_clock::now();
        for (std::size_t at = 0; at < samples.size(); at += period) {
            const std::size_t count = std::min(period, samples.size() - at);
            device.push(samples.data() + at, static_cast<int>(count / format.channels));
            if (!realTime) continue;
            due += std::chrono::duration_cast<std::chrono::steady_clock::duration>(periodTime);
            std::this_thread::sleep_until(due);
        }
    }).join();
}

std::int64_t DeclaredDataBytes(const QString& path) {
    QFile file(path);
    const QByteArray header = file.open(QIODevice::ReadOnly) ? file.read(44) : QByteArray();
    if (header.size() < 44 || header.mid(36, 4) != "data") return -1;
    return qFromLittleEndian<quint32>(header.constData() + 40);
}

double Deviation(const ReadWave& wave, int c, double amplitude, double hertz, long from, long to) {
    double largest = 0;
    for (long f = from; f < to; ++f) {
        const double expected = amplitude * std::sin(2 * std::numbers::pi * hertz * f / wave.rate);
        largest = std::max(largest, std::abs(wave.samples[f * wave.channels + c] - expected));
    }
    return largest;
}
