#pragma once

#include <cstdint>
#include <vector>

// Streaming sample-rate conversion of interleaved mono or stereo audio by a Kaiser-windowed sinc,
// band-limited to the lower of the two Nyquist frequencies so that nothing above the output's
// Nyquist folds back. Output frame k is the input at time k * inRate / outRate, computed exactly in
// integers so a long take never drifts. configure() allocates; process() never does.
class Resampler {
  public:
    static constexpr int kMaxChannels = 2;

    // Off the audio thread. Equal rates pass samples through untouched.
    void configure(int inRate, int outRate, int channels);
    // Forget the history: the next input is the start of a new stream.
    void reset();

    bool passesThrough() const { return inRate_ == outRate_; }
    // An upper bound on the output frames `inputFrames` more input frames can give.
    int maxOutputFrames(int inputFrames) const;
    // How many frames of silence push the last input through the filter.
    int tailFrames() const { return passesThrough() ? 0 : reach_; }

    // Converts `frames` input frames; writes at most `maxOut` output frames and returns how many.
    // `maxOut` below maxOutputFrames(frames) drops the excess.
    int process(const float* in, int frames, float* out, int maxOut) noexcept;

  private:
    float tap(double distance) const;

    int inRate_ = 1;
    int outRate_ = 1;
    int channels_ = 1;
    // The filter reaches this many input frames to either side of an output instant.
    int reach_ = 0;
    // Kaiser-windowed sinc over distances 0..reach_, kTableSteps entries per input frame.
    std::vector<float> table_;
    double stepsPerFrame_ = 0;

    // The latest input frames, a power-of-two ring per channel, and how many came in so far.
    std::vector<float> history_;
    std::int64_t historyMask_ = 0;
    std::int64_t inputCount_ = 0;
    // The next output instant in input frames: whole part plus remainder / outRate_.
    std::int64_t nextWhole_ = 0;
    std::int64_t nextRemainder_ = 0;
};
