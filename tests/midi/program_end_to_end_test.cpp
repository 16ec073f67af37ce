// The whole program as a player runs it: the built orvelle-quindara under Xvfb with the JACK
// server, a MIDI keyboard and a sound module played by JACK clients of the test, and a setup
// file opened through File > Open with the keyboard, as a person would.
#include "jack_peer.h"
#include "support/wave_files.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QTest>

#include <algorithm>
#include <array>

#include <gtest/gtest.h>

namespace {

bool WaitFor(const std::function<bool()>& condition, int milliseconds = 15000) {
    QElapsedTimer clock;
    clock.start();
    while (!condition()) {
        if (clock.elapsed() > milliseconds) return false;
        QTest::qWait(50);
    }
    return true;
}

// A setup file made byte by byte: every slot as a fresh table has it, except slot 60, which
// sends note 64 on channel 3 with bank 1, patch 7, pan 20 and velocity 90, and slot 72, a wave
// pad that plays `wave`.
QByteArray SetupFileBytes(const QByteArray& wave) {
    // Block by block: a fresh slot's value, slot 60's, slot 72's ("" where it is the fresh one).
    const std::array<std::array<QByteArray, 3>, 21> blocks{{
        {"0", "", "1"},                         // function
        {"", "Custom", ""},                     // description
        {"", "64", ""},                         // note ("" here: the slot's own number)
        {"0", "2", ""},     {"127", "90", ""},  // channel, velocity
        {"0", "7", ""},     {"0", "1", ""},     // patch, bank
        {"0", "", ""},      {"0", "", ""},         {"0", "", ""},  // volume, pan, frequency
        {"False", "", ""},  {"0", "", ""},                         // looped, play mode
        {"False", "", ""},  {"False", "", ""},                     // hold, toggle
        {"", "", wave},     {"False", "", "True"},                 // file, assigned
        {"False", "", ""},  {"", "", ""},          {"0", "", ""},  // playing, reserved
        {"0", "", ""},      {"63", "20", ""},                      // reserved, MIDI pan
    }};
    QByteArray bytes;
    for (int block = 0; block < 21; ++block) {
        for (int slot = 0; slot < 128; ++slot) {
            const auto& values = blocks[block];
            QByteArray text = slot == 60 && !values[1].isEmpty()   ? values[1]
                              : slot == 72 && !values[2].isEmpty() ? values[2]
                              : block == 2 && slot != 60           ? QByteArray::number(slot)
                                                                   : values[0];
            bytes.append(static_cast<char>(text.size() & 0xFF));
            bytes.append(static_cast<char>(text.size() >> 8));
            bytes.append(text);
        }
    }
    return bytes;
}

// How many of the messages are exactly this one.
long CountOf(const std::vector<ShortMessage>& messages, const ShortMessage& wanted) {
    return std::count(messages.begin(), messages.end(), wanted);
}

}  // namespace

TEST(ProgramEndToEnd, APlayersFirstMinutesThroughTheRealWindowAndJack) {
    REQUIRE_JACK_SERVER();
    const QString program = QStringLiteral(OQ_PROGRAM_PATH);
    for (const char* tool : {"Xvfb", "xdotool", "jack_connect"}) {
        if (QStandardPaths::findExecutable(QString::fromLatin1(tool)).isEmpty()) {
            if (qgetenv("CI") == "true") FAIL() << tool << " is missing";
            GTEST_SKIP() << tool << " is not installed";
        }
    }
    QTemporaryDir home;
    // Xvfb picks a free display and names it, so a server left over elsewhere is never shared.
    QProcess xvfb;
    xvfb.start("Xvfb", {"-displayfd", "1", "-screen", "0", "1600x1000x24", "-nolisten", "tcp"});
    ASSERT_TRUE(xvfb.waitForStarted());
    ASSERT_TRUE(WaitFor([&] { return xvfb.canReadLine(); }));
    const QString display = ':' + QString::fromLatin1(xvfb.readLine()).trimmed();
    auto stopXvfb = qScopeGuard([&] {
        xvfb.terminate();
        xvfb.waitForFinished(3000);
    });
    ASSERT_TRUE(WaitFor([&] { return QFile::exists("/tmp/.X11-unix/X" + display.mid(1)); }));

    // The keyboard and the sound module; the stored settings name them, so nothing is asked.
    JackPeer peer;
    const QStringList inDevices = peer.sources();
    const QStringList outDevices = peer.destinations();
    int fingerprint = 0;
    for (const QString& name : inDevices + outDevices) fingerprint += name.size();
    const QString settingsDir = home.filePath("config/Tarvik Radio Orvelle Quindara");
    ASSERT_TRUE(QDir().mkpath(settingsDir));
    QFile ini(settingsDir + "/Tarvik Radio Orvelle Quindara.ini");
    ASSERT_TRUE(ini.open(QIODevice::WriteOnly));
    ini.write(QStringLiteral("[MIDI]\nMIDI_Error_Check=%1\nMIDI_Input=%2\nMIDI_Output=%3\n")
                  .arg(fingerprint)
                  .arg(inDevices.indexOf(peer.playingPort()))
                  .arg(outDevices.indexOf(peer.listeningPort()))
                  .toUtf8());
    ini.close();
    const QString wave = home.filePath("hit.wav");
    ASSERT_TRUE(WriteTestWave(wave, 48000, 1, 4800, [](long, int) { return 0.5f; }));
    const QString setupFile = home.filePath("custom.set");
    QFile file(setupFile);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(SetupFileBytes(wave.toUtf8()));
    file.close();

    QProcess running;
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.insert("DISPLAY", display);
    env.insert("QT_QPA_PLATFORM", "xcb");
    env.insert("XDG_CONFIG_HOME", home.filePath("config"));
    env.insert("XDG_RUNTIME_DIR", home.path());
    env.insert("HOME", home.path());
    running.setProcessEnvironment(env);
    running.setProcessChannelMode(QProcess::MergedChannels);
    running.start(program, {});
    ASSERT_TRUE(running.waitForStarted());
    auto stopProgram = qScopeGuard([&] {
        running.kill();
        running.waitForFinished(3000);
    });
    auto run = [&](const QString& tool, const QStringList& arguments) {
        QProcess process;
        process.setProcessEnvironment(env);
        process.start(tool, arguments);
        process.waitForFinished(5000);
        return QString::fromUtf8(process.readAllStandardOutput()).trimmed();
    };
    auto xdotool = [&](const QStringList& arguments) { return run("xdotool", arguments); };
    auto windowNamed = [&](const QString& pattern) {
        return xdotool({"search", "--onlyvisible", "--name", pattern}).section('\n', 0, 0);
    };
    // What MIDI Out sent since `from`.
    auto sentSince = [&](std::size_t from) {
        const std::vector<ShortMessage> all = peer.received();
        return std::vector<ShortMessage>(all.begin() + std::min(from, all.size()), all.end());
    };
    const ShortMessage zOn{144, 57, 127}, zOff{144, 57, 0};

    // Start-up ends by sending the main volume on the default channel.
    ASSERT_TRUE(WaitFor([&] { return !peer.received().empty(); }))
        << running.readAll().toStdString();
    EXPECT_EQ(peer.received().front(), (ShortMessage{176, 7, 100}));

    std::size_t mark = peer.received().size();
    peer.send({144, 60, 100});
    ASSERT_TRUE(WaitFor([&] { return sentSince(mark).size() >= 4; }));
    EXPECT_EQ(sentSince(mark),
              (std::vector<ShortMessage>{{176, 0, 0}, {192, 0, 0}, {176, 10, 63}, {144, 60, 127}}));

    QString windowId;
    ASSERT_TRUE(WaitFor([&] {
        windowId = windowNamed("Tarvik Radio - Orvelle Quindara");
        return !windowId.isEmpty();
    }));
    auto focusWindow = [&] { xdotool({"windowfocus", "--sync", windowId}); };
    focusWindow();

    // Z held for two seconds, the X server repeating it all along: one note-on, one note-off.
    mark = peer.received().size();
    xdotool({"keydown", "z"});
    QTest::qWait(2000);
    xdotool({"keyup", "z"});
    ASSERT_TRUE(WaitFor([&] { return CountOf(sentSince(mark), zOff) >= 1; }));
    QTest::qWait(300);
    EXPECT_EQ(CountOf(sentSince(mark), zOn), 1);
    EXPECT_EQ(CountOf(sentSince(mark), zOff), 1);

    // Another program connects a keyboard of its own to our MIDI In, as a patchbay would.
    RtMidiOut other(RtMidi::UNIX_JACK, "oq-test-other-" + std::to_string(running.processId()));
    other.openVirtualPort("keys");
    run("jack_connect", {"oq-test-other-" + QString::number(running.processId()) + ":keys",
                         "Orvelle Quindara MIDI In:in"});

    // Ctrl+O, then Escape: Ctrl is not left stuck, and the other program's connection stays.
    xdotool({"key", "ctrl+o"});
    ASSERT_TRUE(WaitFor([&] { return !windowNamed("^Open$").isEmpty(); }));
    QTest::qWait(300);
    xdotool({"key", "Escape"});
    ASSERT_TRUE(WaitFor([&] { return windowNamed("^Open$").isEmpty(); }));
    focusWindow();
    mark = peer.received().size();
    xdotool({"key", "z"});
    EXPECT_TRUE(WaitFor([&] { return CountOf(sentSince(mark), zOn) == 1; }, 3000))
        << "Z plays after Ctrl+O and Escape";
    mark = peer.received().size();
    std::vector<unsigned char> note{144, 61, 100};
    other.sendMessage(&note);
    EXPECT_TRUE(WaitFor(
        [&] {
            return CountOf(sentSince(mark), {144, 61, 127}) == 1;
        },
        3000))
        << "the connection made by another program survived the file dialog";

    // The window loses the focus with Z and Ctrl held: Z ends at once and plays on return.
    mark = peer.received().size();
    xdotool({"keydown", "z"});
    xdotool({"keydown", "ctrl"});
    ASSERT_TRUE(WaitFor([&] { return CountOf(sentSince(mark), zOn) == 1; }, 3000));
    xdotool({"mousemove", "1595", "995"});
    const QString root =
        xdotool({"getmouselocation", "--shell"}).section("WINDOW=", 1).section('\n', 0, 0);
    xdotool({"windowfocus", root});
    EXPECT_TRUE(WaitFor([&] { return CountOf(sentSince(mark), zOff) == 1; }, 3000))
        << "a note-off for Z when the focus left";
    xdotool({"keyup", "ctrl"});
    xdotool({"keyup", "z"});
    focusWindow();
    mark = peer.received().size();
    xdotool({"key", "z"});
    EXPECT_TRUE(WaitFor([&] { return CountOf(sentSince(mark), zOn) == 1; }, 3000))
        << "Z plays again once the window has the focus back";

    // File > Open with the keyboard: Ctrl+O, the path typed into the dialog, Enter.
    xdotool({"key", "ctrl+o"});
    ASSERT_TRUE(WaitFor([&] { return !windowNamed("^Open$").isEmpty(); }));
    QTest::qWait(300);
    xdotool({"type", "--delay", "5", setupFile});
    xdotool({"key", "Return"});
    ASSERT_TRUE(WaitFor([&] {
        return !windowNamed("Tarvik Radio - Orvelle Quindara - custom.set").isEmpty();
    })) << "the title names the opened file";

    mark = peer.received().size();
    peer.send({144, 60, 100});
    ASSERT_TRUE(WaitFor([&] { return sentSince(mark).size() >= 4; }));
    EXPECT_EQ(sentSince(mark),
              (std::vector<ShortMessage>{{178, 0, 1}, {194, 7, 0}, {178, 10, 20}, {146, 64, 90}}));

    // Pitch bend on the second channel names pad 72 in its first byte, but plays nothing; a note
    // does, and with its file gone, says so. While that box is up the other pads keep playing.
    ASSERT_TRUE(QFile::remove(wave));
    peer.send({225, 72, 64});
    QTest::qWait(500);
    EXPECT_TRUE(windowNamed("^Orvelle Quindara$").isEmpty()) << "pitch bend played pad 72";
    peer.send({144, 72, 100});
    QString box;
    ASSERT_TRUE(WaitFor([&] {
        box = windowNamed("^Orvelle Quindara$");
        return !box.isEmpty();
    })) << "no message for the missing file";
    mark = peer.received().size();
    peer.send({144, 60, 100});
    EXPECT_TRUE(WaitFor([&] { return sentSince(mark).size() >= 4; }, 3000))
        << "a pad struck while the box is up sounds at once";
    xdotool({"windowfocus", "--sync", box});
    xdotool({"key", "Return"});
    EXPECT_TRUE(WaitFor([&] { return windowNamed("^Orvelle Quindara$").isEmpty(); }));
}
