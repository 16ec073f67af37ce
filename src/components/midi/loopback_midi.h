#pragma once

#include "components/midi/queued_midi_input.h"

#include <atomic>
#include <vector>

// The in-process MIDI backend: for tests, benchmarks and machines without MIDI. Devices are a
// list of names the owner sets; there is no hardware behind them.

class LoopbackMidiInput : public QueuedMidiInput {
    Q_OBJECT
  public:
    explicit LoopbackMidiInput(QStringList deviceNames = {}, QObject* parent = nullptr);

    void setDeviceNames(const QStringList& names) { deviceNames_ = names; }
    QStringList deviceNames() const override { return deviceNames_; }

    bool open(int deviceIndex) override;
    void close() override;
    bool isOpen() const override { return openDevice_.load() >= 0; }
    int deviceIndex() const override { return openDevice_.load(); }
    QString errorText() const override { return errorText_; }

    // A message arriving from the device; callable from any one thread at a time. Ignored
    // while the port is closed, as a real port would.
    void inject(const ShortMessage& message);

  private:
    QStringList deviceNames_;
    std::atomic<int> openDevice_{-1};
    QString errorText_;
};

class LoopbackMidiOutput : public MidiOutputPort {
  public:
    explicit LoopbackMidiOutput(QStringList deviceNames = {});

    void setDeviceNames(const QStringList& names) { deviceNames_ = names; }
    QStringList deviceNames() const override { return deviceNames_; }

    bool open(int deviceIndex) override;
    void close() override { openDevice_ = -1; }
    bool isOpen() const override { return openDevice_ >= 0; }
    int deviceIndex() const override { return openDevice_; }
    QString errorText() const override { return errorText_; }

    // Records the message while open, and hands it on to the connected input if there is one.
    void send(const ShortMessage& message) override;
    void connectTo(LoopbackMidiInput* input) { forwardTo_ = input; }

    // Everything sent while open, oldest first.
    std::vector<ShortMessage> sent;

  private:
    QStringList deviceNames_;
    int openDevice_ = -1;
    QString errorText_;
    LoopbackMidiInput* forwardTo_ = nullptr;
};
