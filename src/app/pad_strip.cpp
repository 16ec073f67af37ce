#include "app/pad_strip.h"

#include "components/widgets/dark_theme.h"
#include "components/widgets/fader.h"
#include "components/widgets/level_meter.h"
#include "components/widgets/lever_switch.h"
#include "components/widgets/rotary_knob.h"
#include "engine/pad_controls.h"

#include <QFileInfo>
#include <QGridLayout>
#include <QLabel>
#include <QPushButton>
#include <QStackedWidget>
#include <QVBoxLayout>

namespace {

QString PanText(int pan) {
    if (pan == 0) return QStringLiteral("Pan: centre");
    return QStringLiteral("Pan: %1 %2 dB")
        .arg(pan < 0 ? "L" : "R")
        .arg(std::abs(pan) / 100.0, 0, 'f', 1);
}

QString VolumeText(int volume) {
    return QStringLiteral("Volume: %1 dB").arg(volume / 100.0, 0, 'f', 1);
}

QString FrequencyText(int hertz) {
    return hertz == 0 ? QStringLiteral("Frequency: the file's own rate")
                      : QStringLiteral("Frequency: %1 Hz").arg(hertz);
}

QFont SmallFont(const QWidget& widget) {
    QFont small = widget.font();
    small.setPointSizeF(small.pointSizeF() * 0.8);
    return small;
}

// The short name a control carries in sight, besides its tool tip.
QLabel* Caption(const QString& text, QWidget* parent) {
    auto* caption = new QLabel(text, parent);
    caption->setAlignment(Qt::AlignCenter);
    caption->setFont(SmallFont(*parent));
    return caption;
}

}  // namespace

// Shows its text whole when there is room, else elided in the middle, where a file name keeps
// both its start and its extension. It never widens its column.
class MiddleElidedLabel : public QLabel {
  public:
    explicit MiddleElidedLabel(QWidget* parent) : QLabel(parent) {
        setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
        setAlignment(Qt::AlignCenter);
    }
    void setFullText(const QString& text) {
        fullText_ = text;
        Elide();
    }

  protected:
    void resizeEvent(QResizeEvent* event) override {
        QLabel::resizeEvent(event);
        Elide();
    }

  private:
    void Elide() { setText(fontMetrics().elidedText(fullText_, Qt::ElideMiddle, width())); }

    QString fullText_;
};

PadStrip::PadStrip(int note, const QString& title, QWidget* parent) : QWidget(parent), note_(note) {
    setObjectName(QStringLiteral("frameWave%1").arg(note));
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(3, 3, 3, 3);
    layout->setSpacing(4);

    title_ = new QLabel(title, this);
    title_->setAlignment(Qt::AlignCenter);
    layout->addWidget(title_);

    ModeSelector = new LeverSwitch(2, this);
    ModeSelector->setObjectName(QStringLiteral("ModeSelector%1").arg(note));
    ModeSelector->setPositionToolTips({QStringLiteral("MIDI note"), QStringLiteral("Wave sound")});
    lblDisplayMidiParameter = new QLabel(QStringLiteral("123"), this);
    lblDisplayMidiParameter->setObjectName(QStringLiteral("lblDisplayMidiParameter%1").arg(note));
    lblDisplayMidiParameter->setAlignment(Qt::AlignCenter);
    lblDisplayMidiParameter->setAutoFillBackground(true);
    QFont big = lblDisplayMidiParameter->font();
    big.setBold(true);
    big.setPointSizeF(big.pointSizeF() * 1.3);
    lblDisplayMidiParameter->setFont(big);
    functionArea_ = new QStackedWidget(this);
    functionArea_->addWidget(ModeSelector);
    functionArea_->addWidget(lblDisplayMidiParameter);
    layout->addWidget(Caption(QStringLiteral("MIDI / Wave"), this));
    layout->addWidget(functionArea_);

    switchLoopOption = new LeverSwitch(4, this);
    switchLoopOption->setObjectName(QStringLiteral("switchLoopOption%1").arg(note));
    QStringList tips;
    for (int position = 0; position < 4; ++position)
        tips << PadControls::LoopOptionToolTip(position);
    switchLoopOption->setPositionToolTips(tips);
    layout->addWidget(Caption(QStringLiteral("Loop"), this));
    layout->addWidget(switchLoopOption, 0, Qt::AlignHCenter);

    knobPan = new RotaryKnob(this);
    knobPan->setObjectName(QStringLiteral("knobPan%1").arg(note));
    knobPan->setRange(-10000, 10000);
    knobPan->setDefaultValue(0);
    knobPan->setValueText(PanText);
    layout->addWidget(Caption(QStringLiteral("Pan"), this));
    layout->addWidget(knobPan, 0, Qt::AlignHCenter);

    auto* levels = new QGridLayout;
    levels->setHorizontalSpacing(2);
    levels->setVerticalSpacing(0);
    sliderVolume = new Fader(this);
    sliderVolume->setObjectName(QStringLiteral("sliderVolume%1").arg(note));
    sliderVolume->setRange(-10000, 0);
    sliderVolume->setValueText(VolumeText);
    Level_Left = new LevelMeter(this);
    Level_Left->setObjectName(QStringLiteral("Level_Left%1").arg(note));
    Level_Right = new LevelMeter(this);
    Level_Right->setObjectName(QStringLiteral("Level_Right%1").arg(note));
    sliderFrequency = new Fader(this);
    sliderFrequency->setObjectName(QStringLiteral("sliderFrequency%1").arg(note));
    sliderFrequency->setRange(0, 100000);
    sliderFrequency->setValueText(FrequencyText);
    // Slim meters between the two faders, their width following the font so they scale.
    const int meterWidth = std::max(6, fontMetrics().height() / 2);
    Level_Left->setFixedWidth(meterWidth);
    Level_Right->setFixedWidth(meterWidth);
    levels->addWidget(sliderVolume, 0, 0);
    levels->addWidget(Level_Left, 0, 1);
    levels->addWidget(Level_Right, 0, 2);
    levels->addWidget(sliderFrequency, 0, 3);
    levels->addWidget(Caption(QStringLiteral("Vol"), this), 1, 0);
    levels->addWidget(Caption(QStringLiteral("Rate"), this), 1, 3);
    levels->setRowStretch(0, 1);
    layout->addLayout(levels, 1);

    waveFile_ = new MiddleElidedLabel(this);
    waveFile_->setObjectName(QStringLiteral("lblWaveFile%1").arg(note));
    waveFile_->setFont(SmallFont(*this));
    waveFile_->setMinimumHeight(waveFile_->fontMetrics().height());  // a MIDI pad keeps the line
    layout->addWidget(waveFile_);

    cmdSelectWaveFile = new QPushButton(QStringLiteral("Select Wave File"), this);
    cmdSelectWaveFile->setObjectName(QStringLiteral("cmdSelectWaveFile%1").arg(note));
    cmdSelectWaveFile->setEnabled(false);  // wave files are chosen once the recorder can save them
    cmdSelectWaveFile->setFont(SmallFont(*this));
    layout->addWidget(cmdSelectWaveFile);

    ShowFunction(false);
}

void PadStrip::ShowInfoLabel(bool shown) {
    functionArea_->setCurrentWidget(shown ? static_cast<QWidget*>(lblDisplayMidiParameter)
                                          : static_cast<QWidget*>(ModeSelector));
}

bool PadStrip::InfoLabelShown() const {
    return functionArea_->currentWidget() == lblDisplayMidiParameter;
}

void PadStrip::ShowWaveFile(const QString& path) {
    wavePath_ = path;
    ShowWaveFileName();
}

void PadStrip::ShowWaveFileName() {
    const QString path = wave_ ? wavePath_ : QString();
    waveFile_->setFullText(QFileInfo(path).fileName());
    waveFile_->setToolTip(path);
}

void PadStrip::ShowFunction(bool wave) {
    wave_ = wave;
    ShowWaveFileName();
    const QColor accent = wave ? WaveAccent() : MidiAccent();
    // The whole column takes the colour of what the pad does, visible from across the room.
    ModeSelector->setAccentColor(accent);
    switchLoopOption->setAccentColor(accent);
    knobPan->setAccentColor(accent);
    sliderVolume->setAccentColor(accent);
    sliderFrequency->setAccentColor(accent);
    title_->setStyleSheet(
        QStringLiteral("QLabel { color: %1; font-weight: bold; }").arg(accent.name()));
}
