#include "components/audio/capture/resampler.h"
#include "capture_signals.h"

#include <gtest/gtest.h>

namespace {

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
    Resampler down;
    down.configure(48000, 11025, 1);
    const std::vector<float> folded = Convert(down, Sine(7000, 48000, 48000, {0.5f}), 1, 512);
    // The sudden start and end splash over every frequency; look between them.
    EXPECT_LT(Rms({folded.begin() + 500, folded.end() - 500}), 0.5 * 1e-4) << "below -80 dB";

    Resampler near;
    near.configure(48000, 44100, 1);
    const std::vector<float> kept = Convert(near, Sine(17000, 48000, 48000, {0.5f}), 1, 512);
    EXPECT_NEAR(FitSine({kept.begin() + 1000, kept.end() - 1000}, 17000, 44100, 1000).amplitude,
                0.5, 0.5 * 0.01);
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
