#pragma once
// Signals to record and the checks made on what comes back: a sine pushed into a device from a
// thread of its own, a channel of a file read back, its header, and a least-squares sine fit.
#include "components/audio/offline_audio_device.h"
#include "support/wave_files.h"

#include <QString>

#include <cstdint>
#include <thread>
#include <vector>

// Interleaved frames whose channel c is amplitudes[c] * sin(2 pi hertz t).
std::vector<float> Sine(double hertz, int rate, std::int64_t frames, std::vector<float> amplitudes);

// Pushes `samples` into the device in periods of `periodFrames`, on its own thread, as a sound
// card's callback would; at the device's pace when `realTime`, else as fast as it can.
class DeviceFeeder {
  public:
    DeviceFeeder(OfflineAudioDevice& device, std::vector<float> samples, bool realTime = false);
    ~DeviceFeeder() { join(); }
    void join() {
        if (thread_.joinable()) thread_.join();
    }

  private:
    std::vector<float> samples_;
    std::thread thread_;
};

// `count` frames of channel `c` of a file read back, from frame `from` on.
std::vector<float> Channel(const ReadWave& wave, int c, long from, long count);
// The length of the sample data as the file's own header states it, -1 without a data chunk:
// what a player that trusts the header will play, where libsndfile would also read past it.
std::int64_t DeclaredDataBytes(const QString& path);

// The best sine of the given frequency through `samples`, and how far they stray from it.
struct SineFit {
    double amplitude = 0;
    double phase = 0;        // radians, of sin(2 pi f t + phase)
    double residualRms = 0;  // what the sine does not explain
};
SineFit FitSine(const std::vector<float>& samples, double hertz, int rate, std::int64_t offset = 0);
double Rms(const std::vector<float>& samples);
