#include "components/audio/sample_buffer.h"

#include <QFile>

#include <sndfile.h>

#include <algorithm>

namespace {

struct SndFileCloser {
    void operator()(SNDFILE* file) const { sf_close(file); }
};

}  // namespace

LoadedSamples LoadSampleFile(const QString& path) {
    if (path.isEmpty()) return {nullptr, QStringLiteral("no file name")};
    SF_INFO info{};
    std::unique_ptr<SNDFILE, SndFileCloser> file(
        sf_open(QFile::encodeName(path).constData(), SFM_READ, &info));
    if (!file) return {nullptr, QString::fromLocal8Bit(sf_strerror(nullptr))};
    if (info.channels < 1 || info.samplerate < 1 || info.frames < 0) {
        return {nullptr, QStringLiteral("not a sound file")};
    }

    auto buffer = std::make_shared<SampleBuffer>();
    buffer->path = path;
    buffer->sampleRate = info.samplerate;
    buffer->channels = std::min(info.channels, 2);
    // MP3 and some Ogg files do not know their length up front: read in blocks until the end.
    constexpr sf_count_t kBlockFrames = 65536;
    std::vector<float> block(static_cast<std::size_t>(kBlockFrames) * info.channels);
    if (info.frames > 0 && info.frames < (sf_count_t{1} << 31)) {
        buffer->samples.reserve(static_cast<std::size_t>(info.frames) * buffer->channels);
    }
    for (;;) {
        const sf_count_t read = sf_readf_float(file.get(), block.data(), kBlockFrames);
        if (read <= 0) break;
        for (sf_count_t frame = 0; frame < read; ++frame) {
            const float* in = &block[static_cast<std::size_t>(frame * info.channels)];
            buffer->samples.push_back(in[0]);
            if (buffer->channels == 2) buffer->samples.push_back(in[1]);
        }
    }
    if (sf_error(file.get()) != SF_ERR_NO_ERROR) {
        return {nullptr, QString::fromLocal8Bit(sf_strerror(file.get()))};
    }
    buffer->frames = static_cast<std::int64_t>(buffer->samples.size()) / buffer->channels;
    return {std::move(buffer), QString()};
}
