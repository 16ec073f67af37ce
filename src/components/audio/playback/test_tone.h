#pragma once

#include "components/audio/playback/sample_buffer.h"

#include <memory>

class AudioEngine;

// 0.3 s of a 440 Hz sine at half level, mono at the given rate, with 10 ms ramps at both ends so
// it starts and stops without a click.
std::shared_ptr<const SampleBuffer> MakeTestTone(int sampleRate);

// Plays the tone once through the running engine on the editor's player voice, centred and at
// full volume. False when the engine is stopped.
bool PlayTestTone(AudioEngine& engine);
