#include "components/audio/capture/capture_sink.h"
#include "capture_signals.h"
#include "components/audio/capture/capture_bands.h"

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

    const auto queued = std::int64_t(CaptureSink::kRingSamples / 2);
    EXPECT_EQ(sink.lostFrames(), pushed - queued);
    std::vector<float> drained(CaptureSink::kRingSamples + 2);
    ASSERT_EQ(sink.queue().read(drained.data(), drained.size(), 2), CaptureSink::kRingSamples);
    drained.resize(CaptureSink::kRingSamples);
    EXPECT_TRUE(std::equal(drained.begin(), drained.end(), ramp.begin()));

    // Room again: nothing more is lost, and a new take starts its count afresh.
    sink.capture(ramp.data(), 256, 2);
    EXPECT_EQ(sink.lostFrames(), pushed - queued);
    sink.configure(44100, 44100, 2);
    EXPECT_EQ(sink.lostFrames(), 0);
    EXPECT_EQ(sink.queue().available(), 0u);
}

TEST(CaptureSink, LevelsAreThePeaksSinceTheLastLook) {
    CaptureSink sink;
    sink.configure(48000, 22050, 2);
    const std::vector<float> loud = Sine(440, 48000, 4800, {0.5f, 0.25f});
    sink.capture(loud.data(), 4800, 2);
    const std::vector<float> quiet = Sine(440, 48000, 4800, {0.1f, 0.05f});
    sink.capture(quiet.data(), 4800, 2);
    CaptureLevels levels = sink.takeLevels();
    EXPECT_NEAR(levels.left, 0.5f, 0.01f) << "the loud part, though the quiet one came later";
    EXPECT_NEAR(levels.right, 0.25f, 0.01f);
    sink.capture(quiet.data(), 4800, 2);
    levels = sink.takeLevels();
    EXPECT_NEAR(levels.left, 0.1f, 0.005f);
    EXPECT_NEAR(levels.right, 0.05f, 0.005f);

    // Mono: the average of the two sides, on both meters.
    sink.configure(48000, 48000, 1);
    sink.capture(loud.data(), 4800, 2);
    levels = sink.takeLevels();
    EXPECT_NEAR(levels.left, 0.375f, 0.005f);
    EXPECT_EQ(levels.left, levels.right);
}

TEST(CaptureSink, OscilloscopeShowsTheLatestWholeBlock) {
    CaptureSink sink;
    sink.configure(44100, 44100, 1);
    EXPECT_EQ(sink.latestBlock().frames, 0) << "nothing before the first block";
    std::vector<float> ramp(3000);
    for (std::size_t i = 0; i < ramp.size(); ++i) ramp[i] = float(i) / 3000.0f;
    sink.capture(ramp.data(), 3000, 1);  // two whole blocks and a part
    const ScopeBlock& block = sink.latestBlock();
    ASSERT_EQ(block.frames, ScopeBlock::kFrames);
    EXPECT_EQ(block.channels, 1);
    EXPECT_TRUE(std::equal(block.samples.begin(), block.samples.begin() + ScopeBlock::kFrames,
                           ramp.begin() + ScopeBlock::kFrames));
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
        for (int k = 0; k < CaptureSpectrum::kBands; ++k) {
            // The Hann window spreads a sine over its band and the two beside it.
            if (std::abs(k - band) > 1) {
                EXPECT_LT(bands[k], -60.0f) << "band " << k;
            }
        }
    }
    ScopeBlock silence;
    silence.frames = ScopeBlock::kFrames;
    for (float level : spectrum.compute(silence)) EXPECT_EQ(level, CaptureSpectrum::kFloorDb);
}

}  // namespace
