#include "components/audio/devices/alsa_silence.h"
#include "components/midi/rtmidi_client.h"
#include "components/midi/rtmidi_input_port.h"
#include "components/midi/rtmidi_output_port.h"

#include <QFile>

#include <alsa/asoundlib.h>
#include <gtest/gtest.h>

TEST(RtMidiBackend, SendsOnlyTheBytesEachStatusCallsFor) {
    // A trailing 0 after a program change would be read as a second change to program 0. Not
    // sendable at all (0): no status, a data byte that is a status, system exclusive.
    const std::pair<ShortMessage, int> lengths[] = {
        {{195, 5, 0}, 2},   {{208, 40, 0}, 2}, {{147, 60, 100}, 3}, {{224, 0, 64}, 3},
        {{0xF8, 0, 0}, 1},  {{0xF3, 2, 0}, 2}, {{60, 100, 0}, 0},   {{144, 200, 100}, 0},
        {{176, 7, 128}, 0}, {{0xF0, 1, 2}, 0}};
    for (const auto& [message, length] : lengths)
        EXPECT_EQ(WireLength(message), length) << int(message.status);
}

// The plain names are checked against a running JACK server in the MIDI tests.
TEST(RtMidiBackend, RecognisesTheProgramsOwnPortsOnly) {
    EXPECT_TRUE(IsOwnPort("Orvelle Quindara MIDI Out-01:out"));   // JACK's name for a second copy
    EXPECT_TRUE(IsOwnPort("Orvelle Quindara MIDI In:in 129:0"));  // the ALSA form
    EXPECT_FALSE(IsOwnPort("system:midi_capture_1"));
    EXPECT_FALSE(IsOwnPort("Orvelle Quindara MIDI Output Monitor:in"));
    EXPECT_FALSE(IsOwnPort("a2j:Orvelle Quindara MIDI Out [130] (capture): out"));
}

// Without the ALSA sequencer and with no JACK server of that name, the backend behaves like a
// computer without MIDI devices: nothing to list, opening fails with a reason, nothing throws,
// and neither alsa-lib nor RtMidi prints to the terminal.
TEST(RtMidiBackend, WithoutAnyMidiSystemThereAreNoDevices) {
    if (QFile::exists(QStringLiteral("/dev/snd/seq"))) GTEST_SKIP() << "an ALSA sequencer is here";
    const QByteArray savedServer = qgetenv("JACK_DEFAULT_SERVER");
    qputenv("JACK_DEFAULT_SERVER", "oq-no-such-server");
    SilenceAlsaLibErrors();
    testing::internal::CaptureStderr();
    {
        RtMidiOutputPort alsa;
        alsa.setMidiSystem(MidiSystem::Alsa);
        EXPECT_EQ(alsa.deviceCount(), 0);
        snd_ctl_t* card = nullptr;
        EXPECT_LT(snd_ctl_open(&card, "hw:CARD=oq_no_such_card", 0), 0);

        RtMidiInputPort in;
        RtMidiOutputPort out;
        EXPECT_EQ(in.deviceCount() + out.deviceCount(), 0);
        EXPECT_FALSE(in.open(0) || out.open(0));
        EXPECT_FALSE(in.errorText().isEmpty() || out.errorText().isEmpty());
        EXPECT_EQ(out.deviceIndex(), -1);
        out.send({144, 60, 100});
        in.close();
        out.close();
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
    if (savedServer.isNull()) {
        qunsetenv("JACK_DEFAULT_SERVER");
    } else {
        qputenv("JACK_DEFAULT_SERVER", savedServer);
    }
}
