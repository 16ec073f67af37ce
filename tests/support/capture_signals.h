#pragma once
// Signals to record and the checks made on what comes back: a sine pushed into a device from a
// thread of its own, a file's header, and how far a channel strays from the sine it should hold.
#include "components/audio/devices/offline_audio_device.h"
#include "support/wave_files.h"

#include <QString>

#include <cstdint>
#include <vector>

// Interleaved frames whose channel c is amplitudes[c] * sin(2 pi hertz t).
std::vector<float> Sine(double hertz, int rate, std::int64_t frames, std::vector<float> amplitudes);

// Pushes `samples` into the device a period at a time from a thread of its own, as a sound
// card's callback would, and returns when all are in; at the device's pace when `realTime`.
void Feed(OfflineAudioDevice& device, const std::vector<float>& samples, bool realTime = false);

// The length of the sample data as the 44-byte header of a take states it, -1 without one: what
// a player that trusts the header will play, where libsndfile would also read past it.
std::int64_t DeclaredDataBytes(const QString& path);

// The largest difference between channel c of `wave`, frames [from, to), and
// amplitude * sin(2 pi hertz t): any level, delay, slipped frame or click shows.
double Deviation(const ReadWave& wave, int c, double amplitude, double hertz, long from, long to);
