#include "components/audio/capture/capture_sink.h"
#include "components/audio/capture/capture_bands.h"
#include "components/audio/capture/resampler.h"
#include "support/capture_signals.h"

#include <gtest/gtest.h>

#include <cmath>

namespace {

TEST(CaptureSink, QueueKeepsTheOldestFramesAndCountsTheRestAsLost) {
    CaptureSink sink;
    sink.configure(44100, 44100, 2);
    const std::int64_t pushed = 10 * 44100;  // twice what the queue holds
    std::vector<float> ramp(static_cast<std::size_t>(pushed) * 2);
    for (std::size_t i = 0; i < ramp.size(); ++i) ramp[i] = float(i % 30000) / 30000.0f;
    for (std::int64_t at = 0; at < pushed; at += 256)
        sink.capture(ramp.data() + at * 2, int(std::min<std::int64_t>(256, pushed - at)), 2);

    const std::int64_t lost = pushed - std::int64_t(CaptureSink::kRingSamples / 2);
    EXPECT_EQ(sink.lostFrames(), lost);
    std::vector<float> drained(CaptureSink::kRingSamples + 2);
    ASSERT_EQ(sink.queue().read(drained.data(), drained.size(), 2), CaptureSink::kRingSamples);
    EXPECT_TRUE(
        std::equal(ramp.begin(), ramp.begin() + CaptureSink::kRingSamples, drained.begin()));
    // The oscilloscope shows the latest whole block all the same: frames 429 * 1024 on.
    const ScopeBlock& block = sink.latestBlock();
    ASSERT_EQ(block.frames, ScopeBlock::kFrames);
    EXPECT_TRUE(std::equal(block.samples.begin(), block.samples.end(), ramp.begin() + 2 * 439296));

    // Room again: nothing more is lost, and a new take starts its count afresh.
    sink.capture(ramp.data(), 256, 2);
    EXPECT_EQ(sink.lostFrames(), lost);
    sink.configure(44100, 44100, 2);
    EXPECT_EQ(sink.lostFrames(), 0);
    EXPECT_EQ(sink.queue().available(), 0u);
}

TEST(CaptureSink, LevelsAreThePeaksSinceTheLastLookAndMonoAveragesTheSides) {
    CaptureSink sink;
    sink.configure(48000, 22050, 2);
    const std::vector<float> loud = Sine(440, 48000, 4800, {0.5f, 0.25f});
    const std::vector<float> quiet = Sine(440, 48000, 4800, {0.1f, 0.05f});
    sink.capture(loud.data(), 4800, 2);
    sink.capture(quiet.data(), 4800, 2);
    CaptureLevels levels = sink.takeLevels();
    EXPECT_NEAR(levels.left, 0.5f, 0.01f) << "the loud part, though the quiet one came later";
    EXPECT_NEAR(levels.right, 0.25f, 0.01f);
    sink.capture(quiet.data(), 4800, 2);
    EXPECT_NEAR(sink.takeLevels().left, 0.1f, 0.005f);

    sink.configure(48000, 48000, 1);
    sink.capture(loud.data(), 4800, 2);
    levels = sink.takeLevels();
    EXPECT_NEAR(levels.left, 0.375f, 0.005f);
    EXPECT_EQ(levels.left, levels.right);
}

TEST(CaptureSpectrum, PutsASineInItsBandAtItsLevel) {
    CaptureSpectrum spectrum;
    CaptureSink sink;
    for (int band : {2, 4, 11}) {
        SCOPED_TRACE(band);
        sink.configure(44100, 44100, 2);
        const double hertz = band * 44100.0 / CaptureSpectrum::kPoints;
        const std::vector<float> sine = Sine(hertz, 44100, 4096, {0.5f, 0.5f});
        sink.capture(sine.data(), 4096, 2);
        const CaptureSpectrum::Bands bands = spectrum.compute(sink.latestBlock());
        EXPECT_NEAR(bands[band], -6.02f, 0.2f) << "half of full scale";
        // The Hann window spreads a sine over its band and the two beside it.
        for (int k = 0; k < CaptureSpectrum::kBands; ++k)
            EXPECT_TRUE(std::abs(k - band) <= 1 || bands[k] < -60.0f) << "band " << k;
    }
    ScopeBlock silence;
    silence.frames = ScopeBlock::kFrames;
    for (float level : spectrum.compute(silence)) EXPECT_EQ(level, CaptureSpectrum::kFloorDb);
}

// Runs interleaved input through in pieces of `piece` frames, the filter's tail included.
std::vector<float> Convert(Resampler& resampler, const std::vector<float>& in, int channels,
                           int piece) {
    std::vector<float> out;
    std::vector<float> scratch(std::size_t(resampler.maxOutputFrames(piece)) * channels);
    auto feed = [&](const float* from, int frames) {
        const int n =
            resampler.process(from, frames, scratch.data(), resampler.maxOutputFrames(frames));
        out.insert(out.end(), scratch.begin(), scratch.begin() + n * channels);
    };
    const std::size_t step = std::size_t(piece) * channels;
    for (std::size_t at = 0; at < in.size(); at += step)
        feed(in.data() + at, int(std::min(step, in.size() - at) / channels));
    const std::vector<float> silence(step, 0.0f);
    for (int left = resampler.tailFrames(); left > 0; left -= piece)
        feed(silence.data(), std::min(left, piece));
    return out;
}

TEST(Resampler, ShutsOutWhatLiesAboveTheNewNyquistFrequency) {
    // 7 kHz would fold back to 4025 Hz at 11025 Hz; 17 kHz must still pass at 44100 Hz.
    const struct {
        int rate;
        double hertz;
        double level;
    } cases[] = {{11025, 7000, 0.0}, {44100, 17000, 0.5}};
    for (const auto& [rate, hertz, level] : cases) {
        Resampler resampler;
        resampler.configure(48000, rate, 1);
        const ReadWave out{rate, 1, Convert(resampler, Sine(hertz, 48000, 48000, {0.5f}), 1, 512)};
        // The sudden start and end splash over every frequency; look between them.
        EXPECT_LT(Deviation(out, 0, level, hertz, 1000, out.frames() - 1000), 1e-4) << rate;
    }
}

TEST(Resampler, GivesTheSameSamplesWhateverThePiecesTheDeviceDelivers) {
    const std::vector<float> in = Sine(1000, 48000, 20000, {0.7f, -0.3f});
    Resampler whole;
    whole.configure(48000, 22050, 2);
    const std::vector<float> once = Convert(whole, in, 2, 20000);
    EXPECT_EQ(once.size(), std::size_t(20000 * 22050 / 48000 + 1) * 2);
    for (int piece : {1, 97, 4096}) {
        Resampler resampler;
        resampler.configure(48000, 22050, 2);
        EXPECT_EQ(Convert(resampler, in, 2, piece), once) << "pieces of " << piece;
    }
}

}  // namespace
