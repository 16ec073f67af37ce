#pragma once

// Stops alsa-lib printing its own error lines ("cannot find card '0'") to the terminal, as it
// does whenever RtAudio or RtMidi look at ALSA on a computer without sound hardware. The
// program reports what it could not open in its own words. Process-wide; call once at start-up.
void SilenceAlsaLibErrors();
