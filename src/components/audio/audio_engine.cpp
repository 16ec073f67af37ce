#include "components/audio/audio_engine.h"

#include "components/audio/devices/audio_device_settings.h"
#include "components/audio/devices/null_audio_device.h"

AudioEngine::AudioEngine(const SettingsStore& settings, QObject* parent)
    : QObject(parent), settings_(&settings), channels_(mixer_) {}

AudioEngine::AudioEngine(std::unique_ptr<AudioOutputDevice> output,
                         std::unique_ptr<AudioInputDevice> input, QObject* parent)
    : QObject(parent),
      channels_(mixer_),
      injectedOutput_(std::move(output)),
      injectedInput_(std::move(input)) {}

AudioEngine::~AudioEngine() {
    stopCapture();
    stop();
}

int AudioEngine::PeriodFrames() const {
    if (injectedOutput_) return injectedOutput_->format().periodFrames;
    return AudioDeviceSettings::Read(*settings_).periodFrames;
}

bool AudioEngine::Play(AudioOutputDevice& device) {
    // The mixer learns the rate while nothing renders.
    mixer_.setDeviceRate(device.format().sampleRate);
    if (!device.start(mixer_)) return false;
    output_ = &device;
    return true;
}

bool AudioEngine::start() {
    if (output_) return true;
    QString failure;
    AudioOutputDevice* device = injectedOutput_.get();
    if (!device) {
        openedOutput_ = OpenOutputDevice(AudioDeviceSettings::Read(*settings_), failure);
        device = openedOutput_.get();
    }
    if (device && Play(*device)) return true;
    if (device) failure = device->errorText();
    openedOutput_ = std::make_unique<NullOutputDevice>(AudioStreamFormat{48000, PeriodFrames(), 2});
    Play(*openedOutput_);
    emit statusNotice(tr("Sound device could not be opened (%1): playing silently").arg(failure));
    return false;
}

void AudioEngine::stop() {
    if (!output_) return;
    output_->stop();
    output_ = nullptr;
    openedOutput_.reset();
    mixer_.resetWhileStopped();
    channels_.soundsCutOff();
}

bool AudioEngine::restart() {
    stop();
    return start();
}

bool AudioEngine::startCapture(AudioCaptureSink& sink, int channels) {
    stopCapture();
    // Silence, when it comes to that, runs at the output's rate.
    const AudioStreamFormat silence{output_ ? output_->format().sampleRate : 48000, PeriodFrames(),
                                    channels};
    QString failure;
    AudioInputDevice* device = injectedInput_.get();
    if (!device) {
        openedInput_ = settings_ ? OpenInputDevice(AudioDeviceSettings::Read(*settings_), channels,
                                                   silence.sampleRate, failure)
                                 : std::make_unique<NullInputDevice>(silence);
        device = openedInput_.get();
    }
    if (device && device->start(sink)) {
        input_ = device;
        return true;
    }
    if (device) failure = device->errorText();
    openedInput_ = std::make_unique<NullInputDevice>(silence);
    openedInput_->start(sink);
    input_ = openedInput_.get();
    emit statusNotice(
        tr("Recording device could not be opened (%1): recording silence").arg(failure));
    return false;
}

void AudioEngine::stopCapture() {
    if (!input_) return;
    input_->stop();
    input_ = nullptr;
    openedInput_.reset();
}

QString AudioEngine::outputDescription() const {
    return output_ ? output_->description() : QString();
}
