// The whole program as a player runs it: the built orvelle-quindara under Xvfb with the JACK
// server, a MIDI keyboard and a sound module played by JACK clients of the test, and a setup
// file opened through File > Open with the keyboard, as a person would.
#include "jack_peer.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QTest>

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
// sends note 64 on channel 3 with bank 1, patch 7, pan 20 and velocity 90.
QByteArray SetupFileBytes() {
    QByteArray bytes;
    auto entry = [&bytes](const QByteArray& text) {
        bytes.append(static_cast<char>(text.size() & 0xFF));
        bytes.append(static_cast<char>(text.size() >> 8));
        bytes.append(text);
    };
    for (int block = 1; block <= 21; ++block) {
        for (int slot = 0; slot < 128; ++slot) {
            const bool custom = slot == 60;
            switch (block) {
                case 1:
                    entry("0");
                    break;  // function
                case 2:
                    entry(custom ? "Custom" : "");
                    break;  // description
                case 3:
                    entry(QByteArray::number(custom ? 64 : slot));
                    break;  // note
                case 4:
                    entry(custom ? "2" : "0");
                    break;  // channel
                case 5:
                    entry(custom ? "90" : "127");
                    break;  // velocity
                case 6:
                    entry(custom ? "7" : "0");
                    break;  // patch
                case 7:
                    entry(custom ? "1" : "0");
                    break;  // bank
                case 11:
                case 13:
                case 14:
                case 16:
                case 17:
                    entry("False");
                    break;
                case 15:
                case 18:
                    entry("");
                    break;  // file, reserved
                case 21:
                    entry(custom ? "20" : "63");
                    break;  // pan
                default:
                    entry("0");
                    break;
            }
        }
    }
    return bytes;
}

}  // namespace

TEST(ProgramEndToEnd, AKeyboardNotePlaysTheSynthAndAnOpenedSetupFileChangesIt) {
    REQUIRE_JACK_SERVER();
    const QString program = QStringLiteral(OQ_PROGRAM_PATH);
    for (const char* tool : {"Xvfb", "xdotool"}) {
        if (QStandardPaths::findExecutable(QString::fromLatin1(tool)).isEmpty()) {
            if (qgetenv("CI") == "true") FAIL() << tool << " is missing";
            GTEST_SKIP() << tool << " is not installed";
        }
    }
    QTemporaryDir home;
    const QString display = QStringLiteral(":%1").arg(60 + QCoreApplication::applicationPid() % 19);
    QProcess xvfb;
    xvfb.start("Xvfb", {display, "-screen", "0", "1600x1000x24", "-nolisten", "tcp"});
    ASSERT_TRUE(xvfb.waitForStarted());
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
    const QString setupFile = home.filePath("custom.set");
    QFile file(setupFile);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(SetupFileBytes());
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

    // Start-up ends by sending the main volume on the default channel.
    ASSERT_TRUE(WaitFor([&] { return !peer.received().empty(); }))
        << running.readAll().toStdString();
    EXPECT_EQ(peer.received().front(), (ShortMessage{176, 7, 100}));

    const std::size_t before = peer.received().size();
    peer.send({144, 60, 100});
    ASSERT_TRUE(WaitFor([&] { return peer.received().size() >= before + 4; }));
    std::vector<ShortMessage> all = peer.received();
    std::vector<ShortMessage> got(all.begin() + before, all.end());
    EXPECT_EQ(got,
              (std::vector<ShortMessage>{{176, 0, 0}, {192, 0, 0}, {176, 10, 63}, {144, 60, 127}}));

    // File > Open with the keyboard: Ctrl+O, the path typed into the dialog, Enter.
    auto xdotool = [&](const QStringList& arguments) {
        QProcess tool;
        tool.setProcessEnvironment(env);
        tool.start("xdotool", arguments);
        tool.waitForFinished(5000);
        return QString::fromUtf8(tool.readAllStandardOutput()).trimmed();
    };
    QString windowId;
    ASSERT_TRUE(WaitFor([&] {
        windowId =
            xdotool({"search", "--name", "Tarvik Radio - Orvelle Quindara"}).section('\n', 0, 0);
        return !windowId.isEmpty();
    }));
    xdotool({"windowfocus", "--sync", windowId});
    xdotool({"key", "ctrl+o"});
    ASSERT_TRUE(WaitFor([&] { return !xdotool({"search", "--name", "^Open$"}).isEmpty(); }));
    QTest::qWait(300);
    xdotool({"type", "--delay", "5", setupFile});
    xdotool({"key", "Return"});
    ASSERT_TRUE(WaitFor([&] {
        return !xdotool({"search", "--name", "Tarvik Radio - Orvelle Quindara - custom.set"})
                    .isEmpty();
    })) << "the title names the opened file";

    const std::size_t afterOpen = peer.received().size();
    peer.send({144, 60, 100});
    ASSERT_TRUE(WaitFor([&] { return peer.received().size() >= afterOpen + 4; }));
    all = peer.received();
    got.assign(all.begin() + afterOpen, all.end());
    EXPECT_EQ(got,
              (std::vector<ShortMessage>{{178, 0, 1}, {194, 7, 0}, {178, 10, 20}, {146, 64, 90}}));
}
