#include "engine/gm_names.h"

#include "components/prompts/scripted_prompts.h"
#include "engine/note_slots.h"

#include <QFile>
#include <QTemporaryDir>

#include <gtest/gtest.h>

namespace {

NoteSlot SlotOn(const char* channel, const char* patch) {
    NoteSlot slot;
    slot.MidiChannel = QString::fromLatin1(channel);
    slot.MidiPatch = QString::fromLatin1(patch);
    return slot;
}

}  // namespace

TEST(GmNames, LineKOfTheShippedListsNamesNumberK) {
    ScriptedPrompts prompts;
    GmNames names(QStringLiteral(OQ_SOURCE_DATA_DIR "/genmidi.txt"),
                  QStringLiteral(OQ_SOURCE_DATA_DIR "/genmididrums.txt"), prompts);
    EXPECT_EQ(names.GetInstrumentName(127), "Gunshot");
    EXPECT_EQ(QStringList({names.GetDrumName(34), names.GetDrumName(35), names.GetDrumName(81),
                           names.GetDrumName(82)}),
              QStringList({"", "Acoustic Bass Drum", "Open Triangle", ""}));
    EXPECT_EQ(names.LoadInstrumentList(true).items.value(10), "  10   Music Box");
    EXPECT_EQ(names.GetMidiInfoText(61, SlotOn("3", "40")), "MIDI Note C#/Db 61  Violin");
    // The reset writes channel text that may carry a leading blank; it still reads as 9.
    EXPECT_EQ(names.GetMidiInfoText(38, SlotOn(" 9", "40")), "MIDI Drum Note  Acoustic Snare");
    EXPECT_EQ(names.GetNoteName(130), "A#/Bb 130 ");
    EXPECT_EQ(names.GetNoteName(-1), "");
    EXPECT_TRUE(prompts.shownMessages.size() == 1 &&
                prompts.shownMessages[0].text == "Invalid MIDI Note");

    QStringList labels;
    for (int note : {48, 49, 56, 57, 72, 73}) labels << GmNames::GetInputLabel(note);
    EXPECT_EQ(labels,
              QStringList({"", "Adaptive Input 1", "Adaptive Input 8", "Note 1", "Note 16", ""}));
}

TEST(GmNames, MissingListsFallBackWithoutCrashing) {
    ScriptedPrompts prompts;
    GmNames names(QStringLiteral("/nonexistent/genmidi.txt"),
                  QStringLiteral("/nonexistent/genmididrums.txt"), prompts);
    EXPECT_EQ(names.GetMidiInfoText(60, SlotOn("0", "0")), "MIDI Note C 60  Instrument Number = 0");
    EXPECT_EQ(names.GetMidiInfoText(60, SlotOn("9", "0")), "MIDI Drum Note  ");
    EXPECT_FALSE(names.LoadDrumList(false).fileFound);
    EXPECT_TRUE(prompts.shownMessages.isEmpty()) << "descriptions and quiet loads never ask";

    EXPECT_EQ(names.LoadInstrumentList(true).items.value(127), " 127");
    names.LoadDrumList(true);
    ASSERT_EQ(prompts.shownMessages.size(), 2);
    EXPECT_EQ(prompts.shownMessages[0].text, "MIDI Instrument info not found...");
    EXPECT_EQ(prompts.shownMessages[1].text, "MIDI Drum info not found...");
}

TEST(GmNames, ShortListsAndOddLineEnds) {
    QTemporaryDir dir;
    QFile file(dir.filePath(QStringLiteral("genmidi.txt")));
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    // Mixed line ends, a line with blanks kept as is, a Windows-1252 byte, no final line end.
    file.write("Piano\r\n  Spaced  \nCaf\xe9 Organ");
    file.close();
    ScriptedPrompts prompts;
    GmNames names(file.fileName(), file.fileName(), prompts);
    EXPECT_EQ(names.GetInstrumentName(1), "  Spaced  ");
    EXPECT_EQ(names.GetInstrumentName(2), QString::fromUtf8("Café Organ"));
    for (int past : {3, -1, 500}) EXPECT_EQ(names.GetDrumName(past), "") << past;
    EXPECT_EQ(names.LoadInstrumentList(true).items.size(), 3);
}
