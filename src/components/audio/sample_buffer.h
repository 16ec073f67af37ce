#pragma once

#include <QString>

#include <cstdint>
#include <memory>
#include <vector>

// A whole sound decoded to float, mono or stereo at the file's own rate. Immutable once made,
// so the audio thread reads it without locks; it is freed on the user-interface thread.
struct SampleBuffer {
    std::vector<float> samples;  // interleaved
    int channels = 1;            // 1 or 2 (files with more keep their first two)
    int sampleRate = 44100;
    std::int64_t frames = 0;
    QString path;
};

struct LoadedSamples {
    std::shared_ptr<const SampleBuffer> buffer;
    QString error;  // why it could not be loaded, when buffer is null
};

// Decodes WAV, AIFF, FLAC, Ogg and MP3 with libsndfile. Runs on the calling thread.
LoadedSamples LoadSampleFile(const QString& path);
