# Sourced by the test scripts: starts a private JACK server (dummy driver) and a private
# PulseAudio daemon (null sink and source) for the tests that go through real sound servers,
# and stops them again by the process ids started here. Nothing else on the machine is touched.
#
#   start_sound_servers   exports JACK_DEFAULT_SERVER, PULSE_SERVER, OQ_JACK_AVAILABLE, OQ_PULSE_AVAILABLE
#   stop_sound_servers

OQ_SERVER_PIDS=()
OQ_SERVER_DIR=""

start_sound_servers() {
    OQ_SERVER_DIR=$(mktemp -d /tmp/oq-servers.XXXXXX)
    export XDG_RUNTIME_DIR="$OQ_SERVER_DIR/runtime"
    mkdir -p "$XDG_RUNTIME_DIR" && chmod 700 "$XDG_RUNTIME_DIR"
    # No client may start a server by itself, now or later.
    export JACK_NO_START_SERVER=1

    local jack_name="oq-test-$$"
    if command -v jackd >/dev/null; then
        jackd -n "$jack_name" -S --no-realtime -d dummy -r 48000 -p 256 \
            >"$OQ_SERVER_DIR/jackd.log" 2>&1 &
        OQ_SERVER_PIDS+=($!)
        if jack_wait -s "$jack_name" -w -t 10 >/dev/null 2>&1; then
            export JACK_DEFAULT_SERVER="$jack_name" OQ_JACK_AVAILABLE=1
            echo "JACK server '$jack_name' running (dummy driver, 48 kHz, 256 frames)"
        else
            echo "JACK server did not start:"; cat "$OQ_SERVER_DIR/jackd.log"
        fi
    fi

    if command -v pulseaudio >/dev/null; then
        local socket="$OQ_SERVER_DIR/pulse.socket"
        cat >"$OQ_SERVER_DIR/server.pa" <<PA
load-module module-null-sink sink_name=oq_null_sink
load-module module-null-source source_name=oq_null_source
load-module module-native-protocol-unix auth-anonymous=1 socket=$socket
set-default-sink oq_null_sink
PA
        HOME="$OQ_SERVER_DIR" pulseaudio -n -F "$OQ_SERVER_DIR/server.pa" --daemonize=no \
            --exit-idle-time=-1 --use-pid-file=no >"$OQ_SERVER_DIR/pulseaudio.log" 2>&1 &
        OQ_SERVER_PIDS+=($!)
        export PULSE_SERVER="unix:$socket"
        local tries=0
        until pactl info >/dev/null 2>&1 || [ $tries -ge 50 ]; do sleep 0.2; tries=$((tries + 1)); done
        if pactl info >/dev/null 2>&1; then
            # A stream that always plays keeps the null sink from stalling when another connects.
            pacat --raw -d oq_null_sink /dev/zero >/dev/null 2>&1 &
            OQ_SERVER_PIDS+=($!)
            export OQ_PULSE_AVAILABLE=1
            echo "PulseAudio running on $PULSE_SERVER (null sink and source)"
        else
            echo "PulseAudio did not start:"; cat "$OQ_SERVER_DIR/pulseaudio.log"
            unset PULSE_SERVER
        fi
    fi
}

stop_sound_servers() {
    local pid
    for pid in "${OQ_SERVER_PIDS[@]}"; do kill "$pid" 2>/dev/null || true; done
    for pid in "${OQ_SERVER_PIDS[@]}"; do wait "$pid" 2>/dev/null || true; done
    OQ_SERVER_PIDS=()
    [ -n "$OQ_SERVER_DIR" ] && rm -rf "$OQ_SERVER_DIR"
    OQ_SERVER_DIR=""
}
