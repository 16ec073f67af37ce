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
    // Mono and stereo files are read straight into place. Files with more channels keep their
    // first two. MP3 and some Ogg files do not know their length up front, so reading goes on in
    // blocks until the end whatever the header said.
    const int fileChannels = info.channels;
    const int keep = buffer->channels;
    constexpr sf_count_t kBlockFrames = 65536;
    std::vector<float> block;
    if (fileChannels != keep) block.resize(static_cast<std::size_t>(kBlockFrames) * fileChannels);
    sf_count_t framesRead = 0;
    for (;;) {
        const sf_count_t expected = std::max<sf_count_t>(info.frames - framesRead, 0);
        const sf_count_t want = expected > 0 ? std::min(expected, kBlockFrames * 16) : kBlockFrames;
        buffer->samples.resize(static_cast<std::size_t>((framesRead + want) * keep));
        float* target = buffer->samples.data() + framesRead * keep;
        sf_count_t read = 0;
        if (fileChannels == keep) {
            read = sf_readf_float(file.get(), target, want);
        } else {
            read = sf_readf_float(file.get(), block.data(), std::min(want, kBlockFrames));
            for (sf_count_t frame = 0; frame < read; ++frame) {
                target[frame * keep] = block[static_cast<std::size_t>(frame * fileChannels)];
                target[frame * keep + 1] =
                    block[static_cast<std::size_t>(frame * fileChannels + 1)];
            }
        }
        if (read <= 0) break;
        framesRead += read;
    }
    buffer->samples.resize(static_cast<std::size_t>(framesRead * keep));
    buffer->samples.shrink_to_fit();
    if (sf_error(file.get()) != SF_ERR_NO_ERROR) {
        return {nullptr, QString::fromLocal8Bit(sf_strerror(file.get()))};
    }
    buffer->frames = framesRead;
    return {std::move(buffer), QString()};
}
