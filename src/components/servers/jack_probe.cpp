#include "components/servers/jack_probe.h"

#include <jack/jack.h>

namespace {

void Silent(const char*) {}

}  // namespace

bool JackServerRunning() {
    // libjack's message functions are process-wide: borrow them for the probe only.
    void (*const savedError)(const char*) = jack_error_callback;
    void (*const savedInfo)(const char*) = jack_info_callback;
    jack_set_error_function(Silent);
    jack_set_info_function(Silent);

    jack_status_t status{};
    jack_client_t* client = jack_client_open("Orvelle Quindara probe", JackNoStartServer, &status);
    if (client != nullptr) jack_client_close(client);

    jack_set_error_function(savedError);
    jack_set_info_function(savedInfo);
    return client != nullptr;
}
