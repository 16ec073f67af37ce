#pragma once

#include "components/audio/capture/scope_exchange.h"

#include <array>

struct fftwf_plan_s;

// The spectrum display's data: a 32-point FFT of the latest samples (the channels mixed), Hann
// windowed and averaged over the half-overlapping 32-sample stretches of one oscilloscope block.
// Band k is centred on k * rate / 32 Hz, k = 0..15; its level is in decibels relative to a
// full-scale sine at that frequency, no lower than kFloorDb. The FFTW plan is made once, here.
class CaptureSpectrum {
  public:
    static constexpr int kPoints = 32;
    static constexpr int kBands = kPoints / 2;
    static constexpr float kFloorDb = -100.0f;
    using Bands = std::array<float, kBands>;

    CaptureSpectrum();
    ~CaptureSpectrum();
    CaptureSpectrum(const CaptureSpectrum&) = delete;
    CaptureSpectrum& operator=(const CaptureSpectrum&) = delete;

    // All floor levels for a block shorter than kPoints frames.
    Bands compute(const ScopeBlock& block);

  private:
    float* input_;
    float (*output_)[2];
    fftwf_plan_s* plan_;
    std::array<float, kPoints> window_{};
    float windowSum_ = 0.0f;
};
