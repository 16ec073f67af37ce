#include "components/audio/sample_buffer.h"

#include <QFile>
#include <QTemporaryDir>

#include <gtest/gtest.h>
#include <sndfile.h>

#include <cmath>

namespace {

// Writes `frames` of a 440 Hz sine in the given format with libsndfile.
bool WriteSine(const QString& path, int format, int channels, int frames = 44100) {
    SF_INFO info{};
    info.samplerate = 44100;
    info.channels = channels;
    info.format = format;
    SNDFILE* file = sf_open(QFile::encodeName(path).constData(), SFM_WRITE, &info);
    if (!file) return false;
    std::vector<float> data(frames * channels);
    for (int f = 0; f < frames; ++f) {
        for (int c = 0; c < channels; ++c) {
            data[f * channels + c] =
                0.5f * std::sin(2 * M_PI * 440 * f / 44100.0) * (c == 0 ? 1 : -1);
        }
    }
    const bool ok = sf_writef_float(file, data.data(), frames) == frames;
    sf_close(file);
    return ok;
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
        // The left channel peaks at 0.5 and the right one is its negative.
        const auto& samples = loaded.buffer->samples;
        float peak = 0, unlike = 0;
        for (std::size_t i = 0; i + 1 < samples.size(); i += 2) {
            peak = std::max(peak, std::fabs(samples[i]));
            unlike = std::max(unlike, std::fabs(samples[i] + samples[i + 1]));
        }
        EXPECT_NEAR(peak, 0.5f, 0.05f);
        EXPECT_LT(unlike, 0.05f);
    }
}

TEST(SampleFiles, DamagedFilesLoadWhatTheyHoldOrSayWhyNot) {
    QTemporaryDir dir;
    // A FLAC whose STREAMINFO claims 2^31-1 frames: the count fills bytes 21 (low half; the high
    // half ends the 16-bit sample size) to 25.
    QFile flac(dir.filePath("lying.flac"));
    ASSERT_TRUE(WriteSine(flac.fileName(), SF_FORMAT_FLAC | SF_FORMAT_PCM_16, 2));
    ASSERT_TRUE(flac.open(QIODevice::ReadWrite) && flac.seek(21) &&
                flac.write("\xF0\x7F\xFF\xFF\xFF", 5) == 5);
    flac.close();
    // A sparse WAV of 4 GiB whose data chunk claims all of it.
    QFile huge(dir.filePath("huge.wav"));
    ASSERT_TRUE(WriteSine(huge.fileName(), SF_FORMAT_WAV | SF_FORMAT_PCM_16, 2, 1));
    ASSERT_TRUE(huge.open(QIODevice::ReadWrite) && huge.resize(qint64{1} << 32) && huge.seek(40) &&
                huge.write("\xD0\xFF\xFF\xFF", 4) == 4);
    huge.close();
    ASSERT_TRUE(WriteSine(dir.filePath("empty.wav"), SF_FORMAT_WAV | SF_FORMAT_PCM_16, 2, 0));
    QFile junk(dir.filePath("junk.mp3"));
    ASSERT_TRUE(junk.open(QIODevice::WriteOnly) && junk.write("this is not a sound at all") > 0);
    junk.close();

    const struct {
        const char* name;
        const char* refusal;  // none for a file that loads
    } cases[] = {{"lying.flac", nullptr},
                 {"huge.wav", "is too long"},
                 {"empty.wav", "holds no sound"},
                 {"junk.mp3", "cannot be opened"},
                 {"absent.wav", "cannot be opened"}};
    for (const auto& file : cases) {
        const QString path = dir.filePath(QString::fromLatin1(file.name));
        const LoadedSamples loaded = LoadSampleFile(path);
        if (!file.refusal) {
            ASSERT_TRUE(loaded.buffer) << loaded.error;
            EXPECT_EQ(loaded.buffer->frames, 44100);
            EXPECT_LT(loaded.buffer->samples.capacity(), std::size_t{1} << 24);
            continue;
        }
        EXPECT_FALSE(loaded.buffer) << file.name;
        EXPECT_TRUE(loaded.error.contains(path) && loaded.error.contains(file.refusal))
            << loaded.error;
    }
}
