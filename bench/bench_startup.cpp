// The built program started for real under Xvfb with a private JACK server: how soon the splash
// and then the main window are on screen, how much memory it holds once running, and how long
// its user-interface thread is ever blocked while a flood of MIDI notes arrives. Then, with no
// sound server at all, how soon after it is started a player can play on its window.
#include <QCoreApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QThread>

#include <benchmark/benchmark.h>
#include <rtmidi/RtMidi.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <memory>
#include <thread>
#include <vector>

namespace {

// A server process of the benchmark's own, ended by its process when the benchmark ends.
class Server {
  public:
    ~Server() {
        if (process_.state() != QProcess::NotRunning) {
            process_.terminate();
            if (!process_.waitForFinished(3000)) process_.kill();
            process_.waitForFinished(3000);
        }
    }
    bool start(const QString& program, const QStringList& arguments,
               const QProcessEnvironment& env) {
        process_.setProcessEnvironment(env);
        process_.setProcessChannelMode(QProcess::ForwardedErrorChannel);
        process_.setStandardOutputFile(QProcess::nullDevice());
        process_.start(program, arguments);
        return process_.waitForStarted(5000);
    }

  private:
    QProcess process_;
};

bool WaitFor(const std::function<bool()>& condition, int milliseconds) {
    QElapsedTimer clock;
    clock.start();
    while (!condition()) {
        if (clock.elapsed() > milliseconds) return false;
        QThread::msleep(20);
    }
    return true;
}

// The system's monotonic clock, which the program's trace uses too.
qint64 MonotonicMilliseconds() {
    QElapsedTimer now;
    now.start();
    return now.msecsSinceReference();
}

// A display number of its own for each benchmark, so a server just ended is never mistaken for
// the next one.
QString FreeDisplay(int first) {
    return QStringLiteral(":%1").arg(first + QCoreApplication::applicationPid() % 9);
}

bool StartXvfb(Server& xvfb, const QString& display, const QProcessEnvironment& env) {
    return xvfb.start("Xvfb", {display, "-screen", "0", "1920x1080x24", "-nolisten", "tcp"}, env) &&
           WaitFor([&] { return QFile::exists("/tmp/.X11-unix/X" + display.mid(1)); }, 10000);
}

QString ProgramPath() {
    // bench_startup lives in build/bench; the program in build/.
    return QDir(QCoreApplication::applicationDirPath())
        .filePath(QStringLiteral("../orvelle-quindara"));
}

// A field of /proc/PID/status in kilobytes ("VmRSS", "RssShmem"), -1 when missing.
qint64 StatusKilobytes(qint64 pid, const QByteArray& field) {
    QFile status(QStringLiteral("/proc/%1/status").arg(pid));
    if (!status.open(QIODevice::ReadOnly)) return -1;
    for (const QByteArray& line : status.readAll().split('\n')) {
        if (line.startsWith(field + ':')) {
            return line.mid(field.size() + 1).trimmed().split(' ').first().toLongLong();
        }
    }
    return -1;
}

}  // namespace

static void startup(benchmark::State& state) {
    for (const char* tool : {"Xvfb", "jackd", "jack_wait"}) {
        if (QStandardPaths::findExecutable(QString::fromLatin1(tool)).isEmpty()) {
            state.SkipWithError((std::string(tool) + " is not installed").c_str());
            return;
        }
    }
    if (!QFile::exists(ProgramPath())) {
        state.SkipWithError("the program is not built next to the benchmarks");
        return;
    }
    QTemporaryDir home;
    const QString display = FreeDisplay(90);
    const QString jackName =
        QStringLiteral("oq-bench-start-%1").arg(QCoreApplication::applicationPid());
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.insert("JACK_NO_START_SERVER", "1");
    env.insert("JACK_DEFAULT_SERVER", jackName);
    env.insert("XDG_RUNTIME_DIR", home.filePath("runtime"));
    env.insert("XDG_CONFIG_HOME", home.filePath("config"));
    QDir(home.path()).mkpath("runtime");
    QFile::setPermissions(home.filePath("runtime"),
                          QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner);
    qputenv("JACK_NO_START_SERVER", "1");
    qputenv("JACK_DEFAULT_SERVER", jackName.toUtf8());

    Server xvfb, jack;
    if (!StartXvfb(xvfb, display, env)) {
        state.SkipWithError("Xvfb did not start");
        return;
    }
    if (!jack.start(
            "jackd",
            {"-n", jackName, "-S", "--no-realtime", "-d", "dummy", "-r", "48000", "-p", "256"},
            env) ||
        QProcess::execute("jack_wait", {"-s", jackName, "-w", "-t", "10"}) != 0) {
        state.SkipWithError("jackd did not start");
        return;
    }

    // The program's MIDI In reads the flood port; its MIDI Out plays into a sink. Both exist
    // before it starts and the stored fingerprint matches, so start-up asks nothing.
    auto flood = std::make_unique<RtMidiOut>(RtMidi::UNIX_JACK, "oq-bench-flood");
    flood->openVirtualPort("notes");
    auto sink = std::make_unique<RtMidiIn>(RtMidi::UNIX_JACK, "oq-bench-sink");
    sink->openVirtualPort("in");
    // Counts what the program sends on while the flood comes in, to be sure it went through.
    static std::atomic<long> received{0};
    sink->setCallback([](double, std::vector<unsigned char>*, void*) { ++received; }, nullptr);
    auto lister = std::make_unique<RtMidiIn>(RtMidi::UNIX_JACK, "oq-bench-lister");
    auto outLister = std::make_unique<RtMidiOut>(RtMidi::UNIX_JACK, "oq-bench-lister-out");
    int fingerprint = 0, floodIndex = -1, sinkIndex = -1;
    for (unsigned i = 0; i < lister->getPortCount(); ++i) {
        const QString name = QString::fromStdString(lister->getPortName(i));
        fingerprint += name.size();
        if (name.startsWith("oq-bench-flood")) floodIndex = static_cast<int>(i);
    }
    for (unsigned i = 0; i < outLister->getPortCount(); ++i) {
        const QString name = QString::fromStdString(outLister->getPortName(i));
        fingerprint += name.size();
        if (name.startsWith("oq-bench-sink")) sinkIndex = static_cast<int>(i);
    }
    lister.reset();
    outLister.reset();
    const QString settingsDir = home.filePath("config/Tarvik Radio Orvelle Quindara");
    QDir().mkpath(settingsDir);
    QFile ini(settingsDir + "/Tarvik Radio Orvelle Quindara.ini");
    ini.open(QIODevice::WriteOnly);
    ini.write(QStringLiteral("[MIDI]\nMIDI_Error_Check=%1\nMIDI_Input=%2\nMIDI_Output=%3\n")
                  .arg(fingerprint)
                  .arg(floodIndex)
                  .arg(sinkIndex)
                  .toUtf8());
    ini.close();

    double toSplash = 0, afterSplash = 0, rss = 0, shared = 0, maxBlock = 0;
    for (auto _ : state) {
        QProcess program;
        QProcessEnvironment programEnv = env;
        programEnv.insert("DISPLAY", display);
        programEnv.insert("QT_QPA_PLATFORM", "xcb");
        programEnv.insert("OQ_TRACE_STARTUP", "1");
        program.setProcessEnvironment(programEnv);
        program.setProcessChannelMode(QProcess::SeparateChannels);
        program.setStandardErrorFile(home.filePath("program.log"));
        const qint64 launched = MonotonicMilliseconds();
        program.start(ProgramPath(), {});
        QHash<QString, qint64> marks;
        QList<QPair<qint64, qint64>> stalls;  // (time, longest gap in the second before it)
        auto readLines = [&] {
            while (program.canReadLine()) {
                const QList<QByteArray> words = program.readLine().trimmed().split(' ');
                if (words.size() == 2)
                    marks.insert(QString::fromLatin1(words[0]), words[1].toLongLong());
                if (words.size() == 3 && words[0] == "ui-block-ms")
                    stalls.append({words[2].toLongLong(), words[1].toLongLong()});
            }
        };
        const bool shown = WaitFor(
            [&] {
                program.waitForReadyRead(50);
                readLines();
                return marks.contains("window-shown");
            },
            20000);
        if (!shown) {
            state.SkipWithError("the main window did not appear (see program.log)");
            program.kill();
            program.waitForFinished();
            return;
        }
        toSplash = marks.value("splash-shown") - launched;
        afterSplash = marks.value("window-shown") - marks.value("splash-closed");

        WaitFor(
            [&] {
                program.waitForReadyRead(50);
                readLines();
                return false;
            },
            3000);
        rss = StatusKilobytes(program.processId(), "VmRSS") / 1024.0;
        // Every JACK client maps the server's shared memory; it counts in the resident size
        // but is the server's, not the program's.
        shared = StatusKilobytes(program.processId(), "RssShmem") / 1024.0;

        // 10,000 note messages within one second: ten every millisecond, on and off in turn.
        received = 0;
        const qint64 floodStart = MonotonicMilliseconds();
        std::vector<unsigned char> message(3);
        const auto begin = std::chrono::steady_clock::now();
        for (int i = 0; i < 10000; ++i) {
            message[0] = 0x90;
            message[1] = static_cast<unsigned char>(57 + i % 16);
            message[2] = static_cast<unsigned char>((i / 16) % 2 ? 0 : 100);
            flood->sendMessage(&message);
            if (i % 10 == 9)
                std::this_thread::sleep_until(begin + std::chrono::milliseconds(i / 10 + 1));
        }
        const qint64 floodEnd = MonotonicMilliseconds();
        WaitFor(
            [&] {
                program.waitForReadyRead(50);
                readLines();
                return false;
            },
            2500);
        for (const auto& [time, gap] : stalls) {
            if (time > floodStart && time <= floodEnd + 2000)
                maxBlock = std::max(maxBlock, static_cast<double>(gap));
        }
        program.terminate();
        if (!program.waitForFinished(5000)) program.kill();
        program.waitForFinished();
    }
    state.counters["startup_to_splash_ms"] = toSplash;
    state.counters["startup_after_splash_ms"] = afterSplash;
    state.counters["rss_after_start_mb"] = rss;
    state.counters["rss_without_jack_shm_mb"] = rss - shared;
    // Each note-on of a MIDI slot goes out as four messages, each note-off as one.
    state.counters["flood_messages_out"] = static_cast<double>(received.load());
    state.counters["midi_flood_max_block_ms"] = maxBlock;
}
BENCHMARK(startup)->Iterations(1)->Unit(benchmark::kMillisecond);

// From the program's start to its main window on screen and taking keys, the splash included,
// with no JACK or PulseAudio server. Where there is no ALSA sequencer either, both "No MIDI ...
// detected" notices come up: the benchmark answers each with Return once it is drawn and leaves
// out the time it stood on screen, which is the player's, not the program's. The median of five
// starts.
static void startup_to_playable_ms(benchmark::State& state) {
    for (const char* tool : {"Xvfb", "xdotool"}) {
        if (QStandardPaths::findExecutable(QString::fromLatin1(tool)).isEmpty()) {
            state.SkipWithError((std::string(tool) + " is not installed").c_str());
            return;
        }
    }
    QTemporaryDir home;
    QDir(home.path()).mkpath("runtime");
    QFile::setPermissions(home.filePath("runtime"),
                          QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner);
    const QString display = FreeDisplay(80);
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.remove("PULSE_SERVER");
    env.insert("JACK_NO_START_SERVER", "1");
    env.insert("JACK_DEFAULT_SERVER", "oq-bench-no-server");
    env.insert("XDG_RUNTIME_DIR", home.filePath("runtime"));
    env.insert("XDG_CONFIG_HOME", home.filePath("config"));
    env.insert("DISPLAY", display);
    env.insert("QT_QPA_PLATFORM", "xcb");
    env.insert("OQ_TRACE_STARTUP", "1");
    Server xvfb;
    if (!StartXvfb(xvfb, display, env)) {
        state.SkipWithError("Xvfb did not start");
        return;
    }
    // Return typed into the notice as a person would: the focus given to it, then the key.
    auto answerNotice = [&] {
        QProcess xdotool;
        xdotool.setProcessEnvironment(env);
        xdotool.setStandardOutputFile(QProcess::nullDevice());
        xdotool.setStandardErrorFile(QProcess::nullDevice());
        xdotool.start("xdotool", {"search", "--onlyvisible", "--name", "^Orvelle Quindara$",
                                  "windowfocus", "--sync", "%1", "key", "Return"});
        xdotool.waitForFinished(5000);
    };

    std::vector<double> starts;
    for (auto _ : state) {
        for (int run = 0; run < 5; ++run) {
            QProcess program;
            program.setProcessEnvironment(env);
            program.setStandardErrorFile(home.filePath("program.log"));
            const qint64 launched = MonotonicMilliseconds();
            program.start(ProgramPath(), {});
            qint64 noticeShown = 0, waitedForPlayer = 0, playable = 0;
            QElapsedTimer sinceAnswer;
            const bool ready = WaitFor(
                [&] {
                    program.waitForReadyRead(20);
                    while (program.canReadLine()) {
                        const QList<QByteArray> words = program.readLine().trimmed().split(' ');
                        if (words.size() != 2) continue;
                        const qint64 at = words[1].toLongLong();
                        if (words[0] == "prompt-shown") {
                            noticeShown = at;
                            sinceAnswer.invalidate();
                        } else if (words[0] == "prompt-closed") {
                            waitedForPlayer += at - noticeShown;
                            noticeShown = 0;
                        } else if (words[0] == "window-playable") {
                            playable = at;
                        }
                    }
                    // A key that came before the notice had the focus is typed again.
                    if (noticeShown != 0 &&
                        (!sinceAnswer.isValid() || sinceAnswer.elapsed() > 300)) {
                        answerNotice();
                        sinceAnswer.start();
                    }
                    return playable != 0;
                },
                20000);
            program.terminate();
            if (!program.waitForFinished(5000)) program.kill();
            program.waitForFinished();
            if (!ready) {
                state.SkipWithError("the main window never took keys (see program.log)");
                return;
            }
            starts.push_back(static_cast<double>(playable - launched - waitedForPlayer));
        }
    }
    std::sort(starts.begin(), starts.end());
    state.counters["startup_to_playable_ms"] = starts[starts.size() / 2];
}
BENCHMARK(startup_to_playable_ms)->Iterations(1)->Unit(benchmark::kMillisecond);
