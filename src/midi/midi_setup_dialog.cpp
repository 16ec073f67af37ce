#include "midi/midi_setup_dialog.h"

#include "components/widgets/device_name_list.h"
#include "components/widgets/dialog_controls.h"

#include <QComboBox>
#include <QGridLayout>
#include <QLabel>
#include <QPushButton>
#include <QScreen>
#include <QShowEvent>
#include <QSignalBlocker>
#include <QVBoxLayout>

namespace {

const char* const kInfoTexts[] = {
    "The purpose of this setup is to enable Orvelle - Quindara software to communicate with the "
    "soundcard and any external MIDI controller like an electronic keyboard, digital piano or "
    "other similar device you might have connected to the computer.",
    "As the names and types of MIDI drivers vary from one computer to another you have to select "
    "the ones that works on your computer.",
    "To select MIDI Out driver choose one from the MIDI Out Driver selection box and click on the "
    "\"Test MIDI Out\" button. If you can hear the sound of a piano note you have found the right "
    "driver. Click \"Ok\" button to accept and save the MIDI settings.",
    "If you have got a MIDI device connected to the computer, please refer to the manual for your "
    "MIDI In driver details.",
    "If you haven't got any MIDI devices connected to the computer you don't have to select any "
    "MIDI In drivers.",
};

// The explanations wrap at this many average characters, which keeps the dialog compact.
constexpr int kInfoWidthInCharacters = 60;

QLabel* Caption(const QString& text, const QString& name, QWidget* buddy) {
    auto* label = new QLabel(text, buddy->parentWidget());
    label->setObjectName(name);
    label->setBuddy(buddy);
    return label;
}

void Fill(QComboBox* list, const QStringList& names, int selection) {
    list->clear();
    for (const QString& name : names) AddDeviceName(list, name);
    list->setCurrentIndex(selection);
}

}  // namespace

MidiSetupDialog::MidiSetupDialog(Context& context, MidiSetup& midiSetup, SettingsStore& settings,
                                 QWidget* parent)
    : QDialog(parent), session_(context, midiSetup, settings) {
    setObjectName(QStringLiteral("frmMIDISETUP"));
    setWindowTitle(QStringLiteral("MIDI Setup"));
    setModal(true);

    comboSystem_ =
        MakeDropDownList(QStringLiteral("ComboMIDISystem"),
                         QStringLiteral("The MIDI system the devices are found on"), this);
    for (MidiSystem system : kMidiSystemChoices) {
        comboSystem_->addItem(MidiSystemChoiceName(system), static_cast<int>(system));
    }
    lblSystemNote_ = new QLabel(this);
    lblSystemNote_->setObjectName(QStringLiteral("lblMIDISystemNote"));
    comboMidiOut_ = MakeDropDownList(QStringLiteral("ComboMIDIOUT"),
                                     QStringLiteral("The device that plays the MIDI slots"), this);
    comboMidiIn_ =
        MakeDropDownList(QStringLiteral("ComboMIDIIN"),
                         QStringLiteral("The keyboard or controller that plays the pads"), this);
    auto* cmdTestMidi =
        MakeDialogButton(QStringLiteral("Test MIDI Out"), QStringLiteral("cmdTestMidi"),
                         QStringLiteral("Hold to sound middle C on the MIDI Out device"), this);
    auto* cmdMoreInfo = MakeDialogButton(QStringLiteral("More Info"), QStringLiteral("cmdMoreInfo"),
                                         QStringLiteral("Explains the choices"), this);
    auto* cmdOK = MakeDialogButton(QStringLiteral("Ok"), QStringLiteral("cmdOK"),
                                   QStringLiteral("Store the devices and open them"), this);
    cmdOK->setDefault(true);
    auto* cmdCancel = MakeDialogButton(QStringLiteral("Cancel"), QStringLiteral("cmdCancel"),
                                       QStringLiteral("Leave the devices as they were"), this);

    auto* system = new QHBoxLayout;
    system->addWidget(comboSystem_);
    system->addWidget(lblSystemNote_);
    system->addStretch();
    auto* choices = new QGridLayout;
    choices->addWidget(
        Caption(QStringLiteral("MIDI System"), QStringLiteral("lblMIDISystem"), comboSystem_), 0,
        0);
    choices->addLayout(system, 1, 0, 1, 2);
    choices->addWidget(
        Caption(QStringLiteral("MIDI Out Driver"), QStringLiteral("lblMIDIOUT"), comboMidiOut_), 2,
        0);
    choices->addWidget(comboMidiOut_, 3, 0);
    choices->addWidget(cmdTestMidi, 3, 1);
    choices->addWidget(
        Caption(QStringLiteral("MIDI In Driver"), QStringLiteral("lblMIDIIN"), comboMidiIn_), 4, 0);
    choices->addWidget(comboMidiIn_, 5, 0);
    choices->addWidget(cmdMoreInfo, 5, 1);
    choices->setColumnStretch(0, 1);

    auto* buttons = new QHBoxLayout;
    buttons->addStretch();
    buttons->addWidget(cmdOK);
    buttons->addWidget(cmdCancel);

    info_ = MakeInfo();
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(choices);
    layout->addLayout(buttons);
    layout->addWidget(info_);
    layout->setSizeConstraint(QLayout::SetFixedSize);

    // The test note sounds while the button is held, by mouse or by the space bar.
    connect(cmdTestMidi, &QPushButton::pressed, this,
            [this] { session_.StartTestNote(comboMidiOut_->currentIndex()); });
    connect(cmdTestMidi, &QPushButton::released, this, [this] {
        if (session_.testNoteSounding()) session_.EndTestNote();
    });
    connect(comboSystem_, &QComboBox::currentIndexChanged, this, [this] {
        const auto system = static_cast<MidiSystem>(comboSystem_->currentData().toInt());
        ShowLists(session_.ChangeSystem(system));
    });
    connect(cmdMoreInfo, &QPushButton::clicked, this, &MidiSetupDialog::ShowMoreInfo);
    connect(cmdOK, &QPushButton::clicked, this, &MidiSetupDialog::accept);
    connect(cmdCancel, &QPushButton::clicked, this, &MidiSetupDialog::reject);

    Load();
}

QWidget* MidiSetupDialog::MakeInfo() {
    auto* info = new QWidget(this);
    info->setObjectName(QStringLiteral("fraInfo"));
    auto* layout = new QVBoxLayout(info);
    layout->setContentsMargins(0, 0, 0, 0);
    const int width = kInfoWidthInCharacters * fontMetrics().averageCharWidth();
    int index = 0;
    for (const char* text : kInfoTexts) {
        auto* label = new QLabel(QString::fromLatin1(text), info);
        label->setObjectName(QStringLiteral("lblinfo%1").arg(index++));
        label->setTextFormat(Qt::PlainText);
        label->setWordWrap(true);
        label->setFixedWidth(width);
        layout->addWidget(label);
    }
    info->hide();
    return info;
}

void MidiSetupDialog::Load() {
    {
        const QSignalBlocker quiet(comboSystem_);
        comboSystem_->setCurrentIndex(
            comboSystem_->findData(static_cast<int>(session_.midiSystem())));
    }
    ShowLists(session_.Load());
    loadWhenShown_ = false;
}

void MidiSetupDialog::ShowLists(const MidiDeviceLists& lists) {
    Fill(comboMidiIn_, lists.inNames, lists.inSelection);
    Fill(comboMidiOut_, lists.outNames, lists.outSelection);
    const QString note = MidiSystemNote(session_.midiSystem());
    lblSystemNote_->setText(note);
    lblSystemNote_->setVisible(!note.isEmpty());
}

void MidiSetupDialog::showEvent(QShowEvent* event) {
    if (!event->spontaneous()) {
        if (loadWhenShown_) Load();
        session_.RememberPorts();
        CentreOnScreen();
    }
    QDialog::showEvent(event);
}

void MidiSetupDialog::CentreOnScreen() {
    const QScreen* screen = this->screen();
    if (screen == nullptr) return;
    adjustSize();
    const QRect area = screen->geometry();
    move(area.x() + (area.width() - width()) / 2, area.y() + (area.height() - height()) / 2);
}

void MidiSetupDialog::ShowMoreInfo() {
    info_->show();
}

void MidiSetupDialog::accept() {
    session_.Accept(comboMidiIn_->currentIndex(), comboMidiIn_->currentData().toString(),
                    comboMidiOut_->currentIndex(), comboMidiOut_->currentData().toString());
    QDialog::accept();
}

void MidiSetupDialog::reject() {
    session_.Cancel();
    loadWhenShown_ = true;
    info_->hide();
    QDialog::reject();
}
