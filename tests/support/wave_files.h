#pragma once

#include <QString>

#include <functional>
#include <vector>

// Test sounds written with libsndfile: `frames` frames at `rate`, each channel's sample given by
// `sample(frame, channel)`. 32-bit float WAV unless `pcm16` is set, so levels stay exact.
bool WriteTestWave(const QString& path, int rate, int channels, long frames,
                   const std::function<float(long frame, int channel)>& sample, bool pcm16 = false);

struct ReadWave {
    int rate = 0;
    int channels = 0;
    std::vector<float> samples;  // interleaved
    long frames() const { return channels ? static_cast<long>(samples.size()) / channels : 0; }
};
// Reads a whole sound file; channels is 0 when it cannot be opened.
ReadWave ReadTestWave(const QString& path);
