#include "wave_files.h"

#include <QFile>

#include <sndfile.h>

bool WriteTestWave(const QString& path, int rate, int channels, long frames,
                   const std::function<float(long, int)>& sample, bool pcm16) {
    SF_INFO info{};
    info.samplerate = rate;
    info.channels = channels;
    info.format = SF_FORMAT_WAV | (pcm16 ? SF_FORMAT_PCM_16 : SF_FORMAT_FLOAT);
    SNDFILE* file = sf_open(QFile::encodeName(path).constData(), SFM_WRITE, &info);
    if (!file) return false;
    std::vector<float> data(static_cast<std::size_t>(frames) * channels);
    for (long f = 0; f < frames; ++f) {
        for (int c = 0; c < channels; ++c) data[f * channels + c] = sample(f, c);
    }
    const bool ok = sf_writef_float(file, data.data(), frames) == frames;
    sf_close(file);
    return ok;
}

ReadWave ReadTestWave(const QString& path) {
    SF_INFO info{};
    SNDFILE* file = sf_open(QFile::encodeName(path).constData(), SFM_READ, &info);
    ReadWave wave;
    if (!file) return wave;
    wave.rate = info.samplerate;
    wave.channels = info.channels;
    wave.samples.resize(static_cast<std::size_t>(info.frames) * info.channels);
    const sf_count_t read = sf_readf_float(file, wave.samples.data(), info.frames);
    wave.samples.resize(static_cast<std::size_t>(read) * info.channels);
    sf_close(file);
    return wave;
}
