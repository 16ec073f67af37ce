#include "audio_setup/audio_setup_dialog.h"

#include "audio_setup/audio_setup_choice.h"
#include "components/audio/audio_engine.h"
#include "components/audio/playback/test_tone.h"
#include "components/widgets/device_name_list.h"
#include "components/widgets/dialog_controls.h"

#include <QComboBox>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QVBoxLayout>

#include <algorithm>

namespace {

constexpr int kUnknownRate = 48000;

// "Default" first (stored as ""), then the names. A stored device the system does not list now
// (its server is down, or it is unplugged) stays on offer, so OK does not forget it.
void FillDeviceList(QComboBox* list, QStringList names, const QString& keep, bool named) {
    list->clear();
    list->addItem(QStringLiteral("Default"), QString());
    list->setEnabled(named);
    if (!named) return;
    if (!keep.isEmpty() && !names.contains(keep)) names.prepend(keep);
    for (const QString& name : names) AddDeviceName(list, name);
    list->setCurrentIndex(std::max(0, list->findData(keep)));
}

}  // namespace

AudioSetupDialog::AudioSetupDialog(AudioEngine& engine, SettingsStore& settings, QWidget* parent)
    : QDialog(parent), engine_(engine), settings_(settings) {
    setObjectName(QStringLiteral("frmAudioSetup"));
    setWindowTitle(QStringLiteral("Audio Setup"));
    setModal(true);

    comboApi_ = MakeDropDownList(QStringLiteral("ComboAudioAPI"),
                                 QStringLiteral("The sound system the pads play through"), this);
    for (AudioApi api : kAudioApiChoices) {
        comboApi_->addItem(AudioApiChoiceName(api), static_cast<int>(api));
    }
    lblApiNote_ = new QLabel(this);
    lblApiNote_->setObjectName(QStringLiteral("lblAudioAPINote"));
    comboOutput_ = MakeDropDownList(QStringLiteral("ComboAudioOUT"),
                                    QStringLiteral("The device that plays the pads"), this);
    comboInput_ = MakeDropDownList(QStringLiteral("ComboAudioIN"),
                                   QStringLiteral("The device the recorder records from"), this);
    comboPeriod_ =
        MakeDropDownList(QStringLiteral("ComboPeriod"),
                         QStringLiteral("Frames per period: fewer play sooner, more are safer "
                                        "on a busy computer"),
                         this);
    for (int frames : kPeriodFrameChoices) comboPeriod_->addItem(QString::number(frames), frames);
    lblLatency_ = new QLabel(this);
    lblLatency_->setObjectName(QStringLiteral("lblLatency"));
    lblLatency_->setToolTip(QStringLiteral("How long one period lasts"));

    auto* cmdTest =
        MakeDialogButton(QStringLiteral("Test"), QStringLiteral("cmdTestAudio"),
                         QStringLiteral("Play a short tone through the sound device in use"), this);
    auto* cmdOK = MakeDialogButton(QStringLiteral("Ok"), QStringLiteral("cmdOK"),
                                   QStringLiteral("Store the choice and restart the sound"), this);
    cmdOK->setDefault(true);
    auto* cmdCancel = MakeDialogButton(QStringLiteral("Cancel"), QStringLiteral("cmdCancel"),
                                       QStringLiteral("Leave the sound as it is"), this);

    auto* period = new QHBoxLayout;
    period->addWidget(comboPeriod_);
    period->addWidget(lblLatency_);
    period->addStretch();
    form_ = new QFormLayout;
    form_->addRow(QStringLiteral("Audio API"), comboApi_);
    form_->addRow(QString(), lblApiNote_);
    form_->addRow(QStringLiteral("Output Device"), comboOutput_);
    form_->addRow(QStringLiteral("Input Device"), comboInput_);
    form_->addRow(QStringLiteral("Period"), period);

    auto* buttons = new QHBoxLayout;
    buttons->addWidget(cmdTest);
    buttons->addStretch();
    buttons->addWidget(cmdOK);
    buttons->addWidget(cmdCancel);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(form_);
    layout->addLayout(buttons);
    layout->setSizeConstraint(QLayout::SetFixedSize);

    const AudioDeviceSettings stored = AudioDeviceSettings::Read(settings_);
    comboApi_->setCurrentIndex(comboApi_->findData(static_cast<int>(stored.api)));
    int periodIndex = comboPeriod_->findData(stored.periodFrames);
    if (periodIndex < 0) {
        // A period set by hand stays what it is until the user picks another.
        comboPeriod_->addItem(QString::number(stored.periodFrames), stored.periodFrames);
        periodIndex = comboPeriod_->count() - 1;
    }
    comboPeriod_->setCurrentIndex(periodIndex);
    FillDevices(stored.outputDevice, stored.inputDevice);
    ShowApiNote();
    ShowLatency();

    connect(comboApi_, &QComboBox::currentIndexChanged, this, [this] {
        const AudioDeviceSettings now = choice();
        FillDevices(now.outputDevice, now.inputDevice);
        ShowApiNote();
    });
    connect(comboPeriod_, &QComboBox::currentIndexChanged, this, &AudioSetupDialog::ShowLatency);
    connect(cmdTest, &QPushButton::clicked, this, [this] { PlayTestTone(engine_); });
    connect(cmdOK, &QPushButton::clicked, this, &AudioSetupDialog::accept);
    connect(cmdCancel, &QPushButton::clicked, this, &AudioSetupDialog::reject);
}

AudioDeviceSettings AudioSetupDialog::choice() const {
    AudioDeviceSettings chosen;
    chosen.api = static_cast<AudioApi>(comboApi_->currentData().toInt());
    chosen.outputDevice = comboOutput_->currentData().toString();
    chosen.inputDevice = comboInput_->currentData().toString();
    chosen.periodFrames = comboPeriod_->currentData().toInt();
    return chosen;
}

void AudioSetupDialog::accept() {
    StoreAudioDeviceSettings(choice(), settings_);
    engine_.restart();
    QDialog::accept();
}

// Automatic and None take no device names: Automatic may pick another system next time.
void AudioSetupDialog::FillDevices(const QString& output, const QString& input) {
    const AudioApi api = static_cast<AudioApi>(comboApi_->currentData().toInt());
    const bool named = api != AudioApi::Automatic && api != AudioApi::None;
    FillDeviceList(comboOutput_, named ? AudioOutputDeviceNames(api) : QStringList(), output,
                   named);
    FillDeviceList(comboInput_, named ? AudioInputDeviceNames(api) : QStringList(), input, named);
}

void AudioSetupDialog::ShowApiNote() {
    const QString note = AudioApiNote(static_cast<AudioApi>(comboApi_->currentData().toInt()));
    lblApiNote_->setText(note);
    form_->setRowVisible(lblApiNote_, !note.isEmpty());
}

void AudioSetupDialog::ShowLatency() {
    lblLatency_->setText(PeriodLatencyText(comboPeriod_->currentData().toInt(), EngineRate()));
}

int AudioSetupDialog::EngineRate() const {
    const AudioOutputDevice* device = engine_.outputDevice();
    return device != nullptr ? device->format().sampleRate : kUnknownRate;
}
