#include "base/text_values.h"

#include <QList>

#include <gtest/gtest.h>

TEST(TextValues, LenientNumberTakesTheLeadingDecimalNumber) {
    QList<int> read;
    for (QStringView text :
         {u" 60", u"-5000", u"+7", u"12abc", u"12.9", u"\t 3 4", u"abc", u"", u"-", u"- 5"})
        read << LenientNumber(text);
    EXPECT_EQ(read, QList<int>({60, -5000, 7, 12, 12, 3, 0, 0, 0, 0}));
    EXPECT_EQ(LenientNumber(u"99999999999999999999"), 2147483647);
    EXPECT_EQ(LenientNumber(u"-99999999999999999999"), -2147483647 - 1);
}

TEST(TextValues, StrictConversionsRefuseAnythingButTheWholeValue) {
    EXPECT_EQ(StrictWholeNumber(u"-2000"), -2000);
    EXPECT_EQ(StrictWholeNumber(u" 44100 "), 44100);
    for (QStringView text : {u"abc", u"", u"12abc", u"1.5", u"99999999999"})
        EXPECT_FALSE(StrictWholeNumber(text)) << text.toString();
    EXPECT_EQ(StrictBoolean(u"True"), true);
    EXPECT_EQ(StrictBoolean(u"false"), false);
    for (QStringView text : {u"1", u"Yes", u""})
        EXPECT_FALSE(StrictBoolean(text)) << text.toString();
}
