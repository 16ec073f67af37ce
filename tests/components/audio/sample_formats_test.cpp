#include "components/audio/playback/sample_buffer.h"

#include <QFile>
#include <QTemporaryDir>

#include <gtest/gtest.h>
#include <sndfile.h>

#include <cmath>

namespace {

// Writes `frames` of a 440 Hz sine in the given format with libsndfile, the right channel the
// left one's negative.
bool WriteSine(const QString& path, int format, int channels, int frames = 44100) {
    SF_INFO info{};
    info.samplerate = 44100;
    info.channels = channels;
    info.format = format;
    SNDFILE* file = sf_open(QFile::encodeName(path).constData(), SFM_WRITE, &info);
    if (!file) return false;
    std::vector<float> data(frames * channels);
    for (int f = 0; f < frames; ++f) {
        for (int c = 0; c < channels; ++c)
            data[f * channels + c] = 0.5f * std::sin(2 * M_PI * 440 * f / 44100.0) * (c ? -1 : 1);
    }
    const bool ok = sf_writef_float(file, data.data(), frames) == frames;
    sf_close(file);
    return ok;
}

// Writes `bytes` into the file at `at`, making it `size` bytes long first when that is given.
bool Patch(const QString& path, qint64 at, const QByteArray& bytes, qint64 size = -1) {
    QFile file(path);
    return file.open(QIODevice::ReadWrite) && (size < 0 || file.resize(size)) && file.seek(at) &&
           file.write(bytes) == bytes.size();
}

}  // namespace

TEST(SampleFiles, EveryFormatAPadMayUseDecodes) {
    QTemporaryDir dir;
    const struct {
        const char* name;
        int format;
        int channels;  // files with more than two keep their first two
    } formats[] = {{"a.wav", SF_FORMAT_WAV | SF_FORMAT_PCM_16, 2},
                   {"a.aiff", SF_FORMAT_AIFF | SF_FORMAT_PCM_24, 2},
                   {"a.flac", SF_FORMAT_FLAC | SF_FORMAT_PCM_16, 2},
                   {"a.ogg", SF_FORMAT_OGG | SF_FORMAT_VORBIS, 2},
                   {"a.mp3", SF_FORMAT_MPEG | SF_FORMAT_MPEG_LAYER_III, 2},
                   {"four.wav", SF_FORMAT_WAV | SF_FORMAT_FLOAT, 4}};
    for (const auto& format : formats) {
        SCOPED_TRACE(format.name);
        const QString path = dir.filePath(QString::fromLatin1(format.name));
        ASSERT_TRUE(WriteSine(path, format.format, format.channels));
        const LoadedSamples loaded = LoadSampleFile(path);
        ASSERT_TRUE(loaded.buffer) << loaded.error;
        EXPECT_EQ(loaded.buffer->channels, 2);
        EXPECT_EQ(loaded.buffer->sampleRate, 44100);
        // Lossy coders add a little padding; the length stays within a few milliseconds.
        EXPECT_NEAR(loaded.buffer->frames, 44100, 2500);
        const auto& samples = loaded.buffer->samples;
        float peak = 0, unlike = 0;
        for (std::size_t i = 0; i + 1 < samples.size(); i += 2) {
            peak = std::max(peak, std::fabs(samples[i]));
            unlike = std::max(unlike, std::fabs(samples[i] + samples[i + 1]));
        }
        EXPECT_NEAR(peak, 0.5f, 0.05f);
        EXPECT_LT(unlike, 0.05f) << "the sides kept apart and in their places";
    }
}

TEST(SampleFiles, DamagedFilesLoadWhatTheyHoldOrSayWhyNot) {
    QTemporaryDir dir;
    auto path = [&](const char* name) { return dir.filePath(QString::fromLatin1(name)); };
    const int wav16 = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    // A FLAC whose STREAMINFO claims 2^31-1 frames: the count fills bytes 21 (low half; the high
    // half ends the 16-bit sample size) to 25.
    ASSERT_TRUE(WriteSine(path("lying.flac"), SF_FORMAT_FLAC | SF_FORMAT_PCM_16, 2) &&
                Patch(path("lying.flac"), 21, QByteArray("\xF0\x7F\xFF\xFF\xFF", 5)));
    // A sparse WAV of 4 GiB whose data chunk claims all of it.
    ASSERT_TRUE(WriteSine(path("huge.wav"), wav16, 2, 1) &&
                Patch(path("huge.wav"), 40, "\xD0\xFF\xFF\xFF", qint64{1} << 32));
    ASSERT_TRUE(WriteSine(path("empty.wav"), wav16, 2, 0));
    ASSERT_TRUE(Patch(path("junk.mp3"), 0, "this is not a sound at all"));

    const struct {
        const char* name;
        const char* refusal;  // none for a file that loads
    } cases[] = {{"lying.flac", nullptr},
                 {"huge.wav", "is too long"},
                 {"empty.wav", "holds no sound"},
                 {"junk.mp3", "cannot be opened"},
                 {"absent.wav", "cannot be opened"}};
    for (const auto& file : cases) {
        const LoadedSamples loaded = LoadSampleFile(path(file.name));
        if (!file.refusal) {
            ASSERT_TRUE(loaded.buffer) << loaded.error;
            EXPECT_EQ(loaded.buffer->frames, 44100);
            EXPECT_LT(loaded.buffer->samples.capacity(), std::size_t{1} << 24);
            continue;
        }
        EXPECT_FALSE(loaded.buffer) << file.name;
        EXPECT_TRUE(loaded.error.contains(path(file.name)) && loaded.error.contains(file.refusal))
            << loaded.error;
    }
}
