#pragma once

// True when a JACK server is running. Asks without starting one and without printing libjack's
// complaints, so a machine without JACK stays quiet.
bool JackServerRunning();
