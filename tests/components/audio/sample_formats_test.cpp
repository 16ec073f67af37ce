#include "components/audio/sample_buffer.h"

#include <QFile>
#include <QTemporaryDir>

#include <gtest/gtest.h>
#include <sndfile.h>

#include <cmath>

namespace {

// Writes a second of a 440 Hz sine in the given format with libsndfile.
bool WriteSine(const QString& path, int format, int channels) {
    SF_INFO info{};
    info.samplerate = 44100;
    info.channels = channels;
    info.format = format;
    SNDFILE* file = sf_open(QFile::encodeName(path).constData(), SFM_WRITE, &info);
    if (!file) return false;
    std::vector<float> data(44100 * channels);
    for (int f = 0; f < 44100; ++f) {
        for (int c = 0; c < channels; ++c) {
            data[f * channels + c] =
                0.5f * std::sin(2 * M_PI * 440 * f / 44100.0) * (c == 0 ? 1 : -1);
        }
    }
    const bool ok = sf_writef_float(file, data.data(), 44100) == 44100;
    sf_close(file);
    return ok;
}

}  // namespace

TEST(SampleFiles, EveryFormatAPadMayUseDecodes) {
    QTemporaryDir dir;
    const struct {
        const char* name;
        int format;
    } formats[] = {{"a.wav", SF_FORMAT_WAV | SF_FORMAT_PCM_16},
                   {"a.aiff", SF_FORMAT_AIFF | SF_FORMAT_PCM_24},
                   {"a.flac", SF_FORMAT_FLAC | SF_FORMAT_PCM_16},
                   {"a.ogg", SF_FORMAT_OGG | SF_FORMAT_VORBIS},
                   {"a.mp3", SF_FORMAT_MPEG | SF_FORMAT_MPEG_LAYER_III}};
    for (const auto& format : formats) {
        SCOPED_TRACE(format.name);
        const QString path = dir.filePath(QString::fromLatin1(format.name));
        ASSERT_TRUE(WriteSine(path, format.format, 2));
        const LoadedSamples loaded = LoadSampleFile(path);
        ASSERT_TRUE(loaded.buffer) << loaded.error;
        EXPECT_EQ(loaded.buffer->channels, 2);
        EXPECT_EQ(loaded.buffer->sampleRate, 44100);
        // Lossy coders add a little padding; the length stays within a few milliseconds.
        EXPECT_NEAR(loaded.buffer->frames, 44100, 2500);
        float peak = 0;
        for (float s : loaded.buffer->samples) peak = std::max(peak, std::fabs(s));
        EXPECT_NEAR(peak, 0.5f, 0.05f);
    }
}

TEST(SampleFiles, ManyChannelsKeepTheFirstTwoAndJunkIsRefused) {
    QTemporaryDir dir;
    const QString path = dir.filePath("four.wav");
    ASSERT_TRUE(WriteSine(path, SF_FORMAT_WAV | SF_FORMAT_FLOAT, 4));
    const LoadedSamples loaded = LoadSampleFile(path);
    ASSERT_TRUE(loaded.buffer) << loaded.error;
    EXPECT_EQ(loaded.buffer->channels, 2);
    EXPECT_EQ(loaded.buffer->frames, 44100);
    EXPECT_FLOAT_EQ(loaded.buffer->samples[2 * 25], 0.5f * std::sin(2 * M_PI * 440 * 25 / 44100.0));
    EXPECT_FLOAT_EQ(loaded.buffer->samples[2 * 25 + 1], -loaded.buffer->samples[2 * 25]);

    QFile junk(dir.filePath("junk.mp3"));
    ASSERT_TRUE(junk.open(QIODevice::WriteOnly));
    junk.write("this is not a sound at all");
    junk.close();
    const LoadedSamples refused = LoadSampleFile(junk.fileName());
    EXPECT_FALSE(refused.buffer);
    EXPECT_FALSE(refused.error.isEmpty());
    EXPECT_FALSE(LoadSampleFile(dir.filePath("absent.wav")).buffer);
}
