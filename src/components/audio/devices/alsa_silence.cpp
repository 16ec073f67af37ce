#include "components/audio/devices/alsa_silence.h"

#include <alsa/asoundlib.h>

namespace {

void Silent(const char*, int, const char*, int, const char*, ...) {}

}  // namespace

void SilenceAlsaLibErrors() {
    snd_lib_error_set_handler(Silent);
}
