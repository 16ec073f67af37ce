#include "components/audio/playback/sample_buffer.h"

#include <QFile>
#include <QFileInfo>

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

// Bytes one sample takes in a file that stores its samples plainly; 0 for compressed data,
// whose 16- or 24-bit subformat says nothing about its size.
int PlainSampleBytes(int format) {
    const int container = format & SF_FORMAT_TYPEMASK;
    if (container == SF_FORMAT_FLAC || container == SF_FORMAT_OGG || container == SF_FORMAT_MPEG)
        return 0;
    switch (format & SF_FORMAT_SUBMASK) {
        case SF_FORMAT_PCM_S8:
        case SF_FORMAT_PCM_U8:
        case SF_FORMAT_ULAW:
        case SF_FORMAT_ALAW:
            return 1;
        case SF_FORMAT_PCM_16:
            return 2;
        case SF_FORMAT_PCM_24:
            return 3;
        case SF_FORMAT_PCM_32:
        case SF_FORMAT_FLOAT:
            return 4;
        case SF_FORMAT_DOUBLE:
            return 8;
        default:
            return 0;
    }
}

// Compressed music holds well under this many frames a byte; silence packs tighter, and its
// buffer simply grows as it decodes.
constexpr std::int64_t kReservedFramesPerCompressedByte = 16;

// The frames worth reserving before decoding: what the header promises, but never more than the
// file's size can hold, since a damaged or hostile header may promise billions.
std::int64_t ExpectedFrames(const SF_INFO& info, std::int64_t fileBytes) {
    const int sampleBytes = PlainSampleBytes(info.format);
    const std::int64_t sizeBound = sampleBytes > 0
                                       ? fileBytes / (std::int64_t{sampleBytes} * info.channels)
                                       : fileBytes * kReservedFramesPerCompressedByte;
    return std::min<std::int64_t>(info.frames, sizeBound);
}

QString Refused(const QString& path, const QString& reason) {
    return QStringLiteral("\"%1\" %2").arg(path, reason);
}

QString TooLong(const QString& path) {
    return Refused(path, QStringLiteral("is too long: a sound may decode to at most %1 MiB")
                             .arg(kMostSoundSamples * std::int64_t{sizeof(float)} >> 20));
}

LoadedSamples Decode(SNDFILE* file, const SF_INFO& info, const QString& path,
                     const DecodeProgress& progress) {
    auto buffer = std::make_shared<SampleBuffer>();
    buffer->path = path;
    buffer->sampleRate = info.samplerate;
    buffer->channels = std::min(info.channels, 2);
    const int fileChannels = info.channels;
    const int keep = buffer->channels;
    const std::int64_t expected = ExpectedFrames(info, QFileInfo(path).size());
    // Plain data is as long as its header says, so an overlong file is refused before decoding.
    if (PlainSampleBytes(info.format) > 0 && expected * keep > kMostSoundSamples) {
        return {nullptr, TooLong(path)};
    }
    buffer->samples.reserve(static_cast<std::size_t>(std::min(expected * keep, kMostSoundSamples)));
    // Read in blocks until the end whatever the header promised (MP3 and some Ogg files do
    // not know their exact length); files with more channels keep their first two. 16-bit
    // files, the common case, are read as integers and converted here, three times faster than
    // libsndfile's own conversion to float.
    const bool pcm16 = (info.format & SF_FORMAT_SUBMASK) == SF_FORMAT_PCM_16;
    constexpr sf_count_t kBlockFrames = 16384;
    std::vector<float> floats(pcm16 ? 0 : static_cast<std::size_t>(kBlockFrames) * fileChannels);
    std::vector<short> shorts(pcm16 ? static_cast<std::size_t>(kBlockFrames) * fileChannels : 0);
    sf_count_t framesRead = 0;
    for (;;) {
        const sf_count_t read = pcm16 ? sf_readf_short(file, shorts.data(), kBlockFrames)
                                      : sf_readf_float(file, floats.data(), kBlockFrames);
        if (read <= 0) break;
        if ((framesRead + read) * keep > kMostSoundSamples) return {nullptr, TooLong(path)};
        const std::size_t at = buffer->samples.size();
        const std::size_t size = at + static_cast<std::size_t>(read) * keep;
        // Beyond the reservation the buffer doubles, but never past the limit.
        if (size > buffer->samples.capacity()) {
            buffer->samples.reserve(std::min(std::max(size, 2 * buffer->samples.capacity()),
                                             static_cast<std::size_t>(kMostSoundSamples)));
        }
        buffer->samples.resize(size);
        float* out = buffer->samples.data() + at;
        for (sf_count_t frame = 0; frame < read; ++frame) {
            for (int c = 0; c < keep; ++c) {
                const std::size_t in = static_cast<std::size_t>(frame * fileChannels + c);
                out[frame * keep + c] = pcm16 ? shorts[in] * (1.0f / 32768.0f) : floats[in];
            }
        }
        framesRead += read;
        // The header's length is only a guide: MP3 may run past it.
        const int percent =
            info.frames > 0
                ? static_cast<int>(std::min<sf_count_t>(99, framesRead * 100 / info.frames))
                : 0;
        if (progress && !progress(percent)) {
            return {nullptr,
                    Refused(path, QStringLiteral("was not decoded: the decode was cancelled"))};
        }
    }
    if (sf_error(file) != SF_ERR_NO_ERROR) {
        return {nullptr, Refused(path, QStringLiteral("cannot be decoded: ") +
                                           QString::fromLocal8Bit(sf_strerror(file)))};
    }
    // A pad given an empty sound would start, sound nothing and end at once.
    if (framesRead == 0) return {nullptr, Refused(path, QStringLiteral("holds no sound"))};
    buffer->frames = framesRead;
    return {std::move(buffer), QString()};
}

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

LoadedSamples LoadSampleFile(const QString& path, const DecodeProgress& progress) {
    if (path.isEmpty()) return {nullptr, QStringLiteral("no file name")};
    SF_INFO info{};
    std::unique_ptr<SNDFILE, SndFileCloser> file(
        sf_open(QFile::encodeName(path).constData(), SFM_READ, &info));
    if (!file) {
        return {nullptr, Refused(path, QStringLiteral("cannot be opened: ") +
                                           QString::fromLocal8Bit(sf_strerror(nullptr)))};
    }
    if (info.channels < 1 || info.samplerate < 1 || info.frames < 0) {
        return {nullptr, Refused(path, QStringLiteral("is not a sound file"))};
    }
    try {
        return Decode(file.get(), info, path, progress);
    } catch (const std::bad_alloc&) {
        return {nullptr, Refused(path, QStringLiteral("does not fit in the memory left"))};
    }
}
