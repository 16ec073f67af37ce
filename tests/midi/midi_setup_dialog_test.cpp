#include "jack_peer.h"
#include "midi_fixture.h"

#include "components/midi/rtmidi_input_port.h"
#include "components/midi/rtmidi_output_port.h"
#include "components/settings/memory_settings_store.h"
#include "components/settings/qsettings_store.h"
#include "midi/midi_setup_dialog.h"
#include "midi/startup_device_check.h"

#include <QComboBox>
#include <QFile>
#include <QLabel>
#include <QPushButton>
#include <QScreen>
#include <QTemporaryDir>
#include <QTest>

#include <memory>

namespace {

const ShortMessage kTestNoteOn{144, 60, 100};
const ShortMessage kTestNoteOff{144, 60, 0};

// Remembers each key written with its value, in the order written.
struct RecordingSettingsStore : MemorySettingsStore {
    QStringList written;
    void setValue(const QString& group, const QString& key, const QString& text) override {
        written.append(group + u'/' + key + u'=' + text);
        MemorySettingsStore::setValue(group, key, text);
    }
};

QComboBox* List(const QDialog& dialog, const char* name) {
    return dialog.findChild<QComboBox*>(QLatin1String(name));
}

QPushButton* Button(const QDialog& dialog, const char* name) {
    return dialog.findChild<QPushButton*>(QLatin1String(name));
}

void Choose(QComboBox* list, const char* text) {
    list->setCurrentIndex(list->findText(QLatin1String(text)));
}

QStringList Items(const QComboBox* list) {
    QStringList items;
    for (int i = 0; i < list->count(); ++i) items.append(list->itemText(i));
    return items;
}

struct MidiSetupDialogTest : MidiTest {
    RecordingSettingsStore settings;

    void SetUp() override {
        midiIn.setDeviceNames({QStringLiteral("Keys")});
        midiOut.setDeviceNames({QStringLiteral("Synth"), QStringLiteral("Drums")});
    }
    std::unique_ptr<MidiSetupDialog> Show() {
        auto dialog = std::make_unique<MidiSetupDialog>(context, setup, settings);
        dialog->show();
        return dialog;
    }
    QString Stored(const char* key) const {
        return settings.value(QStringLiteral("MIDI"), QLatin1String(key));
    }
};

}  // namespace

TEST_F(MidiSetupDialogTest, ListsTheDevicesByNameAndStoresTheChosenNameWhole) {
    context.MidiOutDevice = 1;
    context.MidiDeviceNamesLength = 99;  // from an earlier check
    auto dialog = Show();
    EXPECT_EQ(Items(List(*dialog, "ComboMIDIIN")), QStringList{"Keys"});
    EXPECT_EQ(Items(List(*dialog, "ComboMIDIOUT")), (QStringList{"Synth", "Drums"}));
    EXPECT_EQ(List(*dialog, "ComboMIDIOUT")->currentIndex(), 1);
    EXPECT_EQ(context.MidiDeviceNamesLength, 14);

    // A stored device that no longer exists offers the first one; an empty list selects none.
    // Long names show whole; one wider than the screen is elided in the middle but stored whole.
    const QString longName =
        QStringLiteral("FLUID Synth (qsynth):Synth input port (qsynth:0) 128:0");
    const QString tooLong = QStringLiteral("Start ") + QString(400, u'x') + QStringLiteral(" End");
    context.MidiOutDevice = 5;
    midiIn.setDeviceNames({});
    midiOut.setDeviceNames({longName, tooLong});
    auto again = Show();
    QComboBox* outList = List(*again, "ComboMIDIOUT");
    EXPECT_EQ(outList->currentIndex(), 0);
    EXPECT_EQ(List(*again, "ComboMIDIIN")->currentIndex(), -1);
    EXPECT_FALSE(context.MidiInAvailable);
    EXPECT_GT(outList->width(), again->fontMetrics().horizontalAdvance(longName));
    EXPECT_LE(again->width(), again->screen()->availableGeometry().width());
    const QString shown = outList->itemText(1);
    EXPECT_TRUE(shown != tooLong && shown.startsWith("Start x") && shown.endsWith("x End"));
    EXPECT_EQ(outList->itemData(1, Qt::ToolTipRole).toString(), tooLong);
    outList->setCurrentIndex(1);
    QTest::mouseClick(Button(*again, "cmdOK"), Qt::LeftButton);
    EXPECT_EQ(Stored("MIDI_OutputName"), tooLong);
}

TEST_F(MidiSetupDialogTest, OkStoresTheKeysInOrderAndOpensBothPorts) {
    auto dialog = Show();
    List(*dialog, "ComboMIDIOUT")->setCurrentIndex(1);
    QTest::mouseClick(Button(*dialog, "cmdOK"), Qt::LeftButton);
    EXPECT_EQ(
        settings.written,
        (QStringList{"MIDI/MIDI_Output=1", "MIDI/MIDI_Input=0", "MIDI/MIDI_OutputName=Drums",
                     "MIDI/MIDI_InputName=Keys", "MIDI/MIDI_Error_Check=14", "MIDI/MIDI_System="}));
    EXPECT_EQ(context.MidiOutDevice, 1);
    EXPECT_EQ(midiIn.deviceIndex(), 0);
    EXPECT_EQ(midiOut.deviceIndex(), 1);

    // Without an In device OK stores -1 and says so; the Out port still opens.
    midiIn.setDeviceNames({});
    MidiSetupDialog noIn(context, setup, settings);
    QTest::mouseClick(Button(noIn, "cmdOK"), Qt::LeftButton);
    EXPECT_EQ(Stored("MIDI_Input"), "-1");
    EXPECT_EQ(statusTexts, QStringList{"No avaliable Midi In Devices detected"});
    EXPECT_TRUE(midiOut.isOpen());
}

TEST_F(MidiSetupDialogTest, CancelEscapeAndCloseBoxStoreNothingAndGiveTheOutPortBack) {
    const std::function<void(MidiSetupDialog&)> waysOut[] = {
        [](MidiSetupDialog& d) { QTest::mouseClick(Button(d, "cmdCancel"), Qt::LeftButton); },
        [](MidiSetupDialog& d) { QTest::keyClick(&d, Qt::Key_Escape); },
        [](MidiSetupDialog& d) { d.close(); },
    };
    for (const auto& leave : waysOut) {
        ASSERT_TRUE(midiOut.open(0));
        auto dialog = Show();
        List(*dialog, "ComboMIDIOUT")->setCurrentIndex(1);
        QTest::mouseClick(Button(*dialog, "cmdTestMidi"), Qt::LeftButton);
        leave(*dialog);
        EXPECT_FALSE(dialog->isVisible());
        EXPECT_EQ(midiOut.deviceIndex(), 0);
    }
    EXPECT_EQ(context.MidiOutDevice, 0);

    // Escape while the note still sounds ends it before the port goes back.
    midiOut.sent.clear();
    auto dialog = Show();
    List(*dialog, "ComboMIDIOUT")->setCurrentIndex(1);
    QTest::mousePress(Button(*dialog, "cmdTestMidi"), Qt::LeftButton);
    EXPECT_EQ(midiOut.deviceIndex(), 1);
    QTest::keyClick(dialog.get(), Qt::Key_Escape);
    EXPECT_EQ(midiOut.sent, (std::vector<ShortMessage>{kTestNoteOn, kTestNoteOff}));
    EXPECT_EQ(midiOut.deviceIndex(), 0);

    // A port that was closed stays closed. The next showing loads the devices afresh and hides
    // again the explanations that More Info uncovered.
    midiOut.close();
    midiOut.setDeviceNames({QStringLiteral("Other")});
    dialog->show();
    EXPECT_EQ(Items(List(*dialog, "ComboMIDIOUT")), QStringList{"Other"});
    const QLabel* info = dialog->findChild<QLabel*>(QStringLiteral("lblinfo4"));
    const int heightBefore = dialog->height();
    QTest::mouseClick(Button(*dialog, "cmdMoreInfo"), Qt::LeftButton);
    EXPECT_TRUE(info->isVisible() && dialog->height() > heightBefore);
    QTest::mouseClick(Button(*dialog, "cmdTestMidi"), Qt::LeftButton);
    QTest::mouseClick(Button(*dialog, "cmdCancel"), Qt::LeftButton);
    EXPECT_FALSE(midiOut.isOpen());
    EXPECT_TRUE(settings.written.isEmpty());
    dialog->show();
    EXPECT_FALSE(info->isVisible());
    EXPECT_EQ(dialog->height(), heightBefore);
}

TEST_F(MidiSetupDialogTest, AnotherMidiSystemClosesThePortsAndCancelTakesThemBack) {
    ASSERT_TRUE(midiIn.open(0) && midiOut.open(1));
    auto dialog = Show();
    QComboBox* system = List(*dialog, "ComboMIDISystem");
    Choose(system, "JACK");
    EXPECT_EQ(setup.midiSystem(), MidiSystem::Jack);
    EXPECT_FALSE(midiIn.isOpen() || midiOut.isOpen());
    QTest::keyClick(dialog.get(), Qt::Key_Escape);
    EXPECT_EQ(setup.midiSystem(), MidiSystem::Automatic);
    EXPECT_EQ(midiIn.deviceIndex(), 0);
    EXPECT_EQ(midiOut.deviceIndex(), 1);

    dialog->show();
    EXPECT_EQ(system->currentText(), "Automatic");
}

namespace {

constexpr int kDeadlineMs = 5000;

// The program's RtMidi ports on the running JACK server, a peer to play to and from, and a
// second program whose ports must show as well.
struct JackMidiSetupDialogTest : MidiTest {
    QTemporaryDir folder;
    std::unique_ptr<JackPeer> peer;
    std::unique_ptr<RtMidiIn> bystander;
    std::unique_ptr<RtMidiOut> bystanderOut;

    void SetUp() override {
        REQUIRE_JACK_SERVER();
        peer = std::make_unique<JackPeer>();
        const std::string name =
            "oq-test-bystander-" + std::to_string(QCoreApplication::applicationPid());
        bystander = std::make_unique<RtMidiIn>(RtMidi::UNIX_JACK, name);
        bystander->openVirtualPort("listens");
        bystanderOut = std::make_unique<RtMidiOut>(RtMidi::UNIX_JACK, name + "-out");
        bystanderOut->openVirtualPort("plays");
    }
    QString SettingsFile() const { return folder.filePath(QStringLiteral("settings.ini")); }
};

}  // namespace

TEST_F(JackMidiSetupDialogTest, ChosenPortsHearTheTestNoteAndOpenAgainAtTheNextStart) {
    RtMidiInputPort jackIn;
    RtMidiOutputPort jackOut;
    MidiSetup jackSetup{
        context, jackIn, jackOut, [this](const QString& text) { statusTexts.append(text); }, {}};
    {
        QSettingsStore store(SettingsFile());
        MidiSetupDialog dialog(context, jackSetup, store);
        dialog.show();
        QComboBox* outList = List(dialog, "ComboMIDIOUT");
        QComboBox* inList = List(dialog, "ComboMIDIIN");
        // Automatic takes the running JACK server; the ALSA sequencer does not list its ports.
        EXPECT_EQ(dialog.findChild<QLabel*>("lblMIDISystemNote")->text(), "Uses JACK now");
        if (!QFile::exists(QStringLiteral("/dev/snd/seq"))) {
            Choose(List(dialog, "ComboMIDISystem"), "ALSA");
            EXPECT_EQ(outList->count(), 0);
        }
        Choose(List(dialog, "ComboMIDISystem"), "JACK");
        const QStringList outs = Items(outList);
        const QStringList ins = Items(inList);
        ASSERT_TRUE(outs.contains(peer->listeningPort())) << outs.join(", ");
        ASSERT_EQ(outs.filter(QStringLiteral("oq-test-bystander-")).size(), 1) << outs.join(", ");
        ASSERT_TRUE(ins.contains(peer->playingPort())) << ins.join(", ");
        ASSERT_EQ(ins.filter(QStringLiteral("oq-test-bystander-")).size(), 1) << ins.join(", ");

        outList->setCurrentIndex(static_cast<int>(outs.indexOf(peer->listeningPort())));
        inList->setCurrentIndex(static_cast<int>(ins.indexOf(peer->playingPort())));
        QPushButton* test = Button(dialog, "cmdTestMidi");
        QTest::mousePress(test, Qt::LeftButton);
        EXPECT_TRUE(QTest::qWaitFor([&] { return !peer->received().empty(); }, kDeadlineMs));
        EXPECT_EQ(peer->received(), std::vector<ShortMessage>{kTestNoteOn});
        QTest::mouseRelease(test, Qt::LeftButton);
        EXPECT_TRUE(QTest::qWaitFor([&] { return peer->received().size() >= 2; }, kDeadlineMs));
        EXPECT_EQ(peer->received(), (std::vector<ShortMessage>{kTestNoteOn, kTestNoteOff}));
        EXPECT_FALSE(jackOut.isOpen());
        std::vector<unsigned char> strayMessage;
        bystander->getMessage(&strayMessage);
        EXPECT_TRUE(strayMessage.empty());

        // What OK stores is checked by the next start below.
        QTest::mouseClick(Button(dialog, "cmdOK"), Qt::LeftButton);
        EXPECT_TRUE(jackIn.isOpen() && jackOut.isOpen());
        EXPECT_TRUE(statusTexts.isEmpty()) << statusTexts.join(", ");
    }
    jackSetup.CloseMidiInPort();
    jackSetup.CloseMidiOutPort();

    // The next start: new ports, the same settings file, no question asked.
    Context restarted;
    RtMidiInputPort newIn;
    RtMidiOutputPort newOut;
    MidiSetup newSetup{restarted, newIn, newOut, {}, {}};
    QSettingsStore store(SettingsFile());
    ScriptedPrompts startPrompts;
    EXPECT_EQ(RunStartupMidiCheck(newSetup, restarted, store, startPrompts, {}),
              StartupMidiOutcome::PortsOpened);
    EXPECT_TRUE(startPrompts.shownMessages.isEmpty());
    EXPECT_EQ(newOut.deviceNames().value(newOut.deviceIndex()), peer->listeningPort());
    EXPECT_EQ(newIn.deviceNames().value(newIn.deviceIndex()), peer->playingPort());
    peer->send({144, 61, 1});
    EXPECT_TRUE(QTest::qWaitFor([&] { return newIn.queueLength() > 0; }, kDeadlineMs));
}
