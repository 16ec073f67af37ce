#include "components/audio/capture/capture_bands.h"

#include <fftw3.h>

#include <algorithm>
#include <cmath>
#include <numbers>

CaptureSpectrum::CaptureSpectrum()
    : input_(fftwf_alloc_real(kPoints)),
      output_(fftwf_alloc_complex(kPoints / 2 + 1)),
      plan_(fftwf_plan_dft_r2c_1d(kPoints, input_, output_, FFTW_ESTIMATE)) {
    for (int i = 0; i < kPoints; ++i) {
        window_[i] = static_cast<float>(0.5 - 0.5 * std::cos(2.0 * std::numbers::pi * i / kPoints));
        windowSum_ += window_[i];
    }
}

CaptureSpectrum::~CaptureSpectrum() {
    fftwf_destroy_plan(plan_);
    fftwf_free(output_);
    fftwf_free(input_);
}

CaptureSpectrum::Bands CaptureSpectrum::compute(const ScopeBlock& block) {
    std::array<double, kBands> power{};
    int stretches = 0;
    const int channels = std::clamp(block.channels, 1, 2);
    for (int start = 0; start + kPoints <= block.frames; start += kPoints / 2, ++stretches) {
        for (int i = 0; i < kPoints; ++i) {
            const float* frame = &block.samples[(start + i) * channels];
            const float mixed = channels == 2 ? 0.5f * (frame[0] + frame[1]) : frame[0];
            input_[i] = mixed * window_[i];
        }
        fftwf_execute(plan_);
        for (int k = 0; k < kBands; ++k) {
            // A sine's peak amplitude: both halves of the spectrum, over the window's gain.
            const double scale = (k == 0 ? 1.0 : 2.0) / windowSum_;
            const double re = output_[k][0] * scale;
            const double im = output_[k][1] * scale;
            power[k] += re * re + im * im;
        }
    }
    Bands bands;
    for (int k = 0; k < kBands; ++k) {
        const double mean = stretches ? power[k] / stretches : 0.0;
        bands[k] =
            mean > 0 ? std::max(kFloorDb, static_cast<float>(10.0 * std::log10(mean))) : kFloorDb;
    }
    return bands;
}
