// The File menu of the real window over scripted prompts and loopback MIDI.
#include "program_fixture.h"

#include "app/pad_strip.h"
#include "components/widgets/fader.h"
#include "components/widgets/lever_switch.h"
#include "components/widgets/rotary_knob.h"
#include "setup_files/file_commands.h"

#include <QFile>

namespace {

struct FileMenuTest : ProgramTest {
    MainWindow* window = nullptr;
    QTemporaryDir dir;
    QList<bool> midiInOpenDuringDialogs;
    std::size_t sentDuringDialogs = 0;

    void SetUp() override {
        StoreDevices(0, 0);
        settings->setValue("Files", "LastFolder", dir.path());
        Build();
        // A key on the MIDI keyboard while the dialog is open.
        prompts->whileFileDialogShown = [this] {
            midiInOpenDuringDialogs << midiIn->isOpen();
            const std::size_t before = midiOut->sent.size();
            midiIn->inject({144, 60, 100});
            QCoreApplication::processEvents();
            sentDuringDialogs += midiOut->sent.size() - before;
        };
        program->Start();
        window = &program->window();
        ASSERT_TRUE(midiIn->isOpen());
    }
    Context& context() { return program->context(); }
    QString Path(const char* name) { return dir.filePath(QString::fromLatin1(name)); }
    static QByteArray Bytes(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }
    // An edit as the player makes it: pad 60's play-mode lever moved.
    void Edit() { window->pad(60)->switchLoopOption->setPosition(3); }
};

}  // namespace

TEST_F(FileMenuTest, SavingAnUntitledArrangementAsksWhereAndCancelChangesNothing) {
    Edit();
    window->mnuSave->trigger();  // the dialog is cancelled: nothing scripted
    ASSERT_EQ(prompts->shownSaveDialogs.size(), 1);
    EXPECT_EQ(prompts->shownSaveDialogs[0].filter, "Arrange files (*.set) |*.set");
    EXPECT_EQ(prompts->shownSaveDialogs[0].folder, dir.path());
    EXPECT_TRUE(context().FileChanged);
    EXPECT_EQ(window->windowTitle(), "Tarvik Radio - Orvelle Quindara - Untitled");
    EXPECT_EQ(midiInOpenDuringDialogs, QList<bool>{true}) << "connections to MIDI In stay";
    EXPECT_EQ(sentDuringDialogs, 0U) << "but nothing plays while the dialog is open";
    const std::size_t before = midiOut->sent.size();
    midiIn->inject({144, 60, 100});
    EXPECT_TRUE(QTest::qWaitFor([&] { return midiOut->sent.size() == before + 4; }, 5000))
        << "and MIDI In plays again afterwards";
    EXPECT_TRUE(dir.isValid() && QDir(dir.path()).entryList(QDir::Files).isEmpty());

    prompts->chooseFileNext(Path("a"));  // typed without an extension
    window->mnuSave->trigger();
    EXPECT_TRUE(QFile::exists(Path("a.set")));
    EXPECT_EQ(window->windowTitle(), "Tarvik Radio - Orvelle Quindara - a.set");
    EXPECT_EQ(context().CurrentFileName, Path("a.set"));
    EXPECT_FALSE(context().FileChanged);

    // A titled arrangement is saved again without any question.
    const int questions = prompts->shownMessages.size();
    window->pad(61)->switchLoopOption->setPosition(1);
    window->mnuSave->trigger();
    EXPECT_EQ(prompts->shownSaveDialogs.size(), 2);
    EXPECT_EQ(prompts->shownMessages.size(), questions);
    EXPECT_FALSE(context().FileChanged);
    EXPECT_TRUE(midiIn->isOpen());
}

TEST_F(FileMenuTest, SaveAsOntoAnExistingFileAnsweredNoKeepsTheOldFile) {
    const QString existing = Path("week1.set");
    QFile file(existing);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write("an older arrangement");
    file.close();
    Edit();
    prompts->chooseFileNext(existing);
    prompts->answerNext(PromptButton::No);
    window->mnuSaveAs->trigger();
    ASSERT_EQ(prompts->shownMessages.size(), 1);
    EXPECT_EQ(prompts->shownMessages[0].text, "This file already exists. Replace existing file?");
    EXPECT_EQ(prompts->shownMessages[0].defaultButton, PromptButton::No);
    EXPECT_EQ(Bytes(existing), "an older arrangement");
    EXPECT_TRUE(context().FileChanged);
    EXPECT_TRUE(midiIn->isOpen());

    prompts->chooseFileNext(existing);
    prompts->answerNext(PromptButton::Yes);
    window->mnuSaveAs->trigger();
    EXPECT_EQ(prompts->shownSaveDialogs.last().filter, "Setup files (*.set) |*.set");
    EXPECT_EQ(window->windowTitle(), "Tarvik Radio - Orvelle Quindara - week1.set");
    EXPECT_NE(Bytes(existing), "an older arrangement");
}

TEST_F(FileMenuTest, ARoundTripThroughSaveNewAndOpenRestoresEverySlotAndControl) {
    PadStrip* pad = window->pad(66);
    pad->ModeSelector->setPosition(1);
    pad->switchLoopOption->setPosition(2);
    pad->sliderVolume->setValue(-1500);
    pad->knobPan->setValue(3000);
    pad->sliderFrequency->setValue(32000);
    context().NoteSlots[20].MidiPatch = "40";
    const NoteSlotTable before = context().NoteSlots;
    prompts->chooseFileNext(Path("set one.set"));
    window->mnuSaveAs->trigger();

    window->mnuNew->trigger();
    EXPECT_TRUE(prompts->shownMessages.isEmpty());
    EXPECT_EQ(pad->sliderVolume->value(), 0);
    EXPECT_EQ(pad->ModeSelector->position(), 0);
    EXPECT_EQ(window->windowTitle(), "Tarvik Radio - Orvelle Quindara - Untitled");

    prompts->chooseFileNext(Path("set one.set"));
    window->mnuOpen->trigger();
    EXPECT_EQ(context().NoteSlots, before);
    EXPECT_EQ(pad->ModeSelector->position(), 1);
    EXPECT_EQ(pad->switchLoopOption->position(), 2);
    EXPECT_EQ(pad->sliderVolume->value(), -1500);
    EXPECT_EQ(pad->knobPan->value(), 3000);
    EXPECT_EQ(pad->sliderFrequency->value(), 32000);
    EXPECT_EQ(window->windowTitle(), "Tarvik Radio - Orvelle Quindara - set one.set");
    EXPECT_FALSE(context().FileChanged);
    EXPECT_EQ(midiInOpenDuringDialogs, QList<bool>({true, true}));
    EXPECT_EQ(sentDuringDialogs, 0U);
}

TEST_F(FileMenuTest, NewStopsWhenTheSaveItAskedForDoesNotHappen) {
    Edit();
    const NoteSlotTable edited = context().NoteSlots;
    // Yes with the dialog cancelled; Yes with a write that fails; Escape on the question.
    prompts->answerNext(PromptButton::Yes);
    window->mnuNew->trigger();
    prompts->answerNext(PromptButton::Yes);
    prompts->chooseFileNext("/proc/arrangement.set");
    window->mnuNew->trigger();
    EXPECT_EQ(prompts->shownMessages.last().icon, PromptIcon::Critical);
    prompts->answerNext(PromptButton::Cancel);
    window->mnuOpen->trigger();
    EXPECT_EQ(prompts->shownMessages.last().escapeButton, PromptButton::Cancel);

    EXPECT_EQ(prompts->shownOpenDialogs.size(), 0);
    EXPECT_EQ(context().NoteSlots, edited);
    EXPECT_TRUE(context().FileChanged);
    EXPECT_EQ(settings->value("Files", "LastFolder"), dir.path()) << "a failed save is no folder";
    settings->setValue("Files", "LastFolder", "/proc");
    EXPECT_NE(program->fileCommands().StartFolder(), "/proc") << "no dialog lists /proc";
}

TEST_F(FileMenuTest, NewAfterNoKeepsTheChangesMarkedAndABrokenFileChangesNothing) {
    Edit();
    prompts->answerNext(PromptButton::No);
    window->mnuNew->trigger();
    EXPECT_EQ(prompts->shownMessages.last().text, "Save changes to your file??");
    EXPECT_EQ(context().NoteSlots[60].WavePlayMode, "0") << "the table is reset";
    EXPECT_TRUE(context().FileChanged) << "so the next command asks again";

    const QString broken = Path("broken.set");
    QFile file(broken);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(QByteArray(300, '\x7f'));
    file.close();
    Edit();
    const NoteSlotTable before = context().NoteSlots;
    prompts->answerNext(PromptButton::No);
    prompts->chooseFileNext(broken);
    window->mnuOpen->trigger();
    ASSERT_GE(prompts->shownMessages.size(), 2);
    EXPECT_TRUE(prompts->shownMessages.last().text.contains(broken))
        << "the message names the file";
    EXPECT_EQ(prompts->shownMessages.last().icon, PromptIcon::Critical);
    EXPECT_EQ(context().NoteSlots, before);
    EXPECT_TRUE(context().FileChanged);
    EXPECT_TRUE(context().CurrentFileName.isEmpty());
    EXPECT_EQ(window->windowTitle(), "Tarvik Radio - Orvelle Quindara - Untitled");
    EXPECT_TRUE(midiIn->isOpen());
}

TEST_F(FileMenuTest, MissingWaveFilesAreNamedInOneMessage) {
    for (int note : {58, 63}) {
        NoteSlot& slot = context().NoteSlots[note];
        slot.NoteFunction = "1";
        slot.WaveAssigned = "True";
        slot.WaveFileName = Path(note == 58 ? "kick.wav" : "snare.wav");
        channels->channel(note).unloadableFiles << slot.WaveFileName;
    }
    prompts->chooseFileNext(Path("kit.set"));
    window->mnuSaveAs->trigger();
    prompts->chooseFileNext(Path("kit.set"));
    window->mnuOpen->trigger();
    ASSERT_EQ(prompts->shownMessages.size(), 1);
    EXPECT_TRUE(prompts->shownMessages[0].text.contains(Path("kick.wav")));
    EXPECT_TRUE(prompts->shownMessages[0].text.contains(Path("snare.wav")));
    EXPECT_EQ(context().NoteSlots[58].WaveFileName, Path("kick.wav")) << "the slot keeps its path";
}

TEST_F(FileMenuTest, ClosingAsksAboutTheArrangementThenTheTakes) {
    Edit();
    context().RecordingUnsaved[3] = true;
    // The arrangement: Yes, but the save dialog is cancelled, so the window stays.
    prompts->answerNext(PromptButton::Yes);
    EXPECT_FALSE(window->close());
    EXPECT_EQ(prompts->shownMessages.last().text, "Save changes to your file??");
    EXPECT_TRUE(window->isVisible());

    prompts->answerNext(PromptButton::Cancel);  // Escape, or the question's close box
    EXPECT_FALSE(window->close());
    EXPECT_TRUE(context().FileChanged);

    // No to the arrangement; then the takes: Yes keeps the window for them.
    prompts->answerNext(PromptButton::No);
    prompts->answerNext(PromptButton::Yes);
    EXPECT_FALSE(window->close());
    EXPECT_EQ(prompts->shownMessages.last().text, "Do yo want to save any recorded material?");

    // Exit refuses outright while a take is unsaved, and does nothing while one records.
    const int shown = prompts->shownMessages.size();
    window->mnuExit->trigger();
    EXPECT_EQ(prompts->shownMessages.last().text, "Please save or trash any recorded material");
    EXPECT_TRUE(window->isVisible());
    context().Recording = true;
    window->mnuExit->trigger();
    EXPECT_FALSE(window->close());
    EXPECT_EQ(prompts->shownMessages.size(), shown + 1) << "closing while recording asks nothing";
    context().Recording = false;

    // No and No: the program shuts down.
    prompts->answerNext(PromptButton::No);
    prompts->answerNext(PromptButton::No);
    EXPECT_TRUE(window->close());
    EXPECT_FALSE(midiIn->isOpen());
}
