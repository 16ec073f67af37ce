#include "engine/text_values.h"

#include <gtest/gtest.h>

TEST(TextValues, LenientNumberTakesTheLeadingDecimalNumber) {
    EXPECT_EQ(LenientNumber(u" 60"), 60);
    EXPECT_EQ(LenientNumber(u"-5000"), -5000);
    EXPECT_EQ(LenientNumber(u"+7"), 7);
    EXPECT_EQ(LenientNumber(u"12abc"), 12);
    EXPECT_EQ(LenientNumber(u"12.9"), 12);
    EXPECT_EQ(LenientNumber(u"\t 3 4"), 3);
    EXPECT_EQ(LenientNumber(u"abc"), 0);
    EXPECT_EQ(LenientNumber(u""), 0);
    EXPECT_EQ(LenientNumber(u"-"), 0);
    EXPECT_EQ(LenientNumber(u"- 5"), 0);
    EXPECT_EQ(LenientNumber(u"99999999999999999999"), 2147483647);
    EXPECT_EQ(LenientNumber(u"-99999999999999999999"), -2147483647 - 1);
}

TEST(TextValues, StrictConversionsRefuseAnythingButTheWholeValue) {
    EXPECT_EQ(StrictWholeNumber(u"-2000"), -2000);
    EXPECT_EQ(StrictWholeNumber(u" 44100 "), 44100);
    EXPECT_FALSE(StrictWholeNumber(u"abc"));
    EXPECT_FALSE(StrictWholeNumber(u""));
    EXPECT_FALSE(StrictWholeNumber(u"12abc"));
    EXPECT_FALSE(StrictWholeNumber(u"1.5"));
    EXPECT_FALSE(StrictWholeNumber(u"99999999999"));

    EXPECT_EQ(StrictBoolean(u"True"), true);
    EXPECT_EQ(StrictBoolean(u"false"), false);
    EXPECT_FALSE(StrictBoolean(u"1"));
    EXPECT_FALSE(StrictBoolean(u"Yes"));
    EXPECT_FALSE(StrictBoolean(u""));
}
