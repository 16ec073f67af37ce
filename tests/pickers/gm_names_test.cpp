#include "pickers/gm_names.h"

#include "components/prompts/scripted_prompts.h"
#include "engine/note_slots.h"

#include <QFile>
#include <QTemporaryDir>

#include <gtest/gtest.h>

namespace {

const QString kInstruments = QStringLiteral(OQ_SOURCE_DATA_DIR "/genmidi.txt");
const QString kDrums = QStringLiteral(OQ_SOURCE_DATA_DIR "/genmididrums.txt");

NoteSlot SlotOn(const char* channel, const char* patch) {
    NoteSlot slot;
    slot.MidiChannel = QString::fromLatin1(channel);
    slot.MidiPatch = QString::fromLatin1(patch);
    return slot;
}

}  // namespace

TEST(GmNames, ShippedListsNameAllProgramsAndThePercussionKeys) {
    ScriptedPrompts prompts;
    GmNames names(kInstruments, kDrums, prompts);
    EXPECT_EQ(names.GetInstrumentName(0), "Acoustic Grand Piano");
    EXPECT_EQ(names.GetInstrumentName(40), "Violin");
    EXPECT_EQ(names.GetInstrumentName(127), "Gunshot");
    EXPECT_EQ(names.GetDrumName(34), "");
    EXPECT_EQ(names.GetDrumName(35), "Acoustic Bass Drum");
    EXPECT_EQ(names.GetDrumName(38), "Acoustic Snare");
    EXPECT_EQ(names.GetDrumName(81), "Open Triangle");
    EXPECT_EQ(names.GetDrumName(82), "");
    EXPECT_EQ(names.GetDrumName(127), "");

    const GmNames::ListItems instruments = names.LoadInstrumentList(true);
    const GmNames::ListItems drums = names.LoadDrumList(true);
    ASSERT_EQ(instruments.items.size(), 128);
    ASSERT_EQ(drums.items.size(), 128);
    EXPECT_EQ(instruments.items[0], "  0   Acoustic Grand Piano");
    EXPECT_EQ(instruments.items[10], "  10   Music Box");
    EXPECT_EQ(drums.items[36], "  36   Bass Drum 1");
    EXPECT_TRUE(prompts.shownMessages.isEmpty());
}

TEST(GmNames, DescriptionsOfMelodicAndDrumSlots) {
    ScriptedPrompts prompts;
    GmNames names(kInstruments, kDrums, prompts);
    EXPECT_EQ(names.GetMidiInfoText(60, SlotOn("0", "0")), "MIDI Note C 60  Acoustic Grand Piano");
    EXPECT_EQ(names.GetMidiInfoText(61, SlotOn("3", "40")), "MIDI Note C#/Db 61  Violin");
    // The reset writes channel text that may carry a leading blank; it still reads as 9.
    EXPECT_EQ(names.GetMidiInfoText(38, SlotOn(" 9", "40")), "MIDI Drum Note  Acoustic Snare");
    EXPECT_EQ(names.GetMidiInfoText(60, SlotOn("9", "0")), "MIDI Drum Note  Hi Bongo");
    EXPECT_EQ(names.GetMidiInfoText(20, SlotOn("9", "0")), "MIDI Drum Note  ");
}

TEST(GmNames, MissingListsFallBackWithoutCrashing) {
    ScriptedPrompts prompts;
    GmNames names(QStringLiteral("/nonexistent/genmidi.txt"),
                  QStringLiteral("/nonexistent/genmididrums.txt"), prompts);
    EXPECT_EQ(names.GetInstrumentName(0), "Instrument Number = 0");
    EXPECT_EQ(names.GetMidiInfoText(60, SlotOn("0", "0")), "MIDI Note C 60  Instrument Number = 0");
    EXPECT_EQ(names.GetMidiInfoText(60, SlotOn("9", "0")), "MIDI Drum Note  ");
    EXPECT_TRUE(prompts.shownMessages.isEmpty()) << "descriptions never ask";

    const GmNames::ListItems quiet = names.LoadDrumList(false);
    EXPECT_FALSE(quiet.fileFound);
    EXPECT_TRUE(prompts.shownMessages.isEmpty());

    const GmNames::ListItems instruments = names.LoadInstrumentList(true);
    ASSERT_EQ(instruments.items.size(), 128);
    EXPECT_EQ(instruments.items[0], " 0");
    EXPECT_EQ(instruments.items[127], " 127");
    ASSERT_EQ(prompts.shownMessages.size(), 1);
    EXPECT_EQ(prompts.shownMessages[0].title, "Please reinstall Orvelle Quindara");
    EXPECT_EQ(prompts.shownMessages[0].text, "MIDI Instrument info not found...");
    names.LoadDrumList(true);
    EXPECT_EQ(prompts.shownMessages.last().text, "MIDI Drum info not found...");
}

TEST(GmNames, ShortAndLongListsAndOddLineEnds) {
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("genmidi.txt"));
    QFile file(path);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    // Mixed line ends, a line with blanks kept as is, a Windows-1252 byte, no final line end.
    file.write("Piano\r\n  Spaced  \nCaf\xe9 Organ");
    file.close();

    ScriptedPrompts prompts;
    GmNames names(path, path, prompts);
    EXPECT_EQ(names.GetInstrumentName(1), "  Spaced  ");
    EXPECT_EQ(names.GetInstrumentName(2), QString::fromUtf8("Café Organ"));
    EXPECT_EQ(names.GetInstrumentName(3), "") << "a line past the end is empty";
    EXPECT_EQ(names.GetInstrumentName(-1), "");
    EXPECT_EQ(names.GetDrumName(500), "");
    EXPECT_EQ(names.LoadInstrumentList(true).items.size(), 3);

    ASSERT_TRUE(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
    for (int i = 0; i < 130; ++i) file.write("x\r\n");
    file.close();
    EXPECT_EQ(names.LoadInstrumentList(true).items.size(), 130);
}

TEST(GmNames, NoteNamesAndInputLabels) {
    ScriptedPrompts prompts;
    GmNames names(kInstruments, kDrums, prompts);
    EXPECT_EQ(names.GetNoteName(0), "C 0 ");
    EXPECT_EQ(names.GetNoteName(61), "C#/Db 61 ");
    EXPECT_EQ(names.GetNoteName(127), "G 127 ");
    EXPECT_EQ(names.GetNoteName(130), "A#/Bb 130 ");
    EXPECT_TRUE(prompts.shownMessages.isEmpty());
    EXPECT_EQ(names.GetNoteName(-1), "");
    ASSERT_EQ(prompts.shownMessages.size(), 1);
    EXPECT_EQ(prompts.shownMessages[0].text, "Invalid MIDI Note");
    EXPECT_EQ(prompts.shownMessages[0].title, "Orvelle Quindara");

    EXPECT_EQ(GmNames::GetInputLabel(48), "");
    EXPECT_EQ(GmNames::GetInputLabel(49), "Adaptive Input 1");
    EXPECT_EQ(GmNames::GetInputLabel(56), "Adaptive Input 8");
    EXPECT_EQ(GmNames::GetInputLabel(57), "Note 1");
    EXPECT_EQ(GmNames::GetInputLabel(72), "Note 16");
    EXPECT_EQ(GmNames::GetInputLabel(73), "");
}
