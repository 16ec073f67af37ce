#pragma once
// Tests against the real JACK and PulseAudio servers skip without them, except on CI
// (CI=true), which starts both: there a missing server is a failure.
#include <QByteArray>

#include <gtest/gtest.h>

#define REQUIRE_SOUND_SERVER(available, name)                                                     \
    do {                                                                                          \
        if (!(available)) {                                                                       \
            if (qgetenv("CI") == "true") FAIL() << "CI runs a " name " server, but none answers"; \
            GTEST_SKIP() << "no " name                                                            \
                            " server (source scripts/sound-servers.sh and run "                   \
                            "start_sound_servers)";                                               \
        }                                                                                         \
    } while (false)
