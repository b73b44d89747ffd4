#include "Text.h"

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(Text, ControlCharactersDoNotBreakTheLine) {
    EXPECT_EQ(onOneLine("a\nb\x01\x7F\tc"), "a\\x0Ab\\x01\\x7F\\x09c");
}

TEST(Text, OtherCharactersStay) {
    EXPECT_EQ(onOneLine("gr\xC3\xBC\xC3\x9F \\ \""), "gr\xC3\xBC\xC3\x9F \\ \"");
}

TEST(Text, JsonTextIsAsciiWhateverIsInIt) {
    EXPECT_EQ(toAscii(Json("\xC3\xBC")), "\"\\u00fc\"");
    EXPECT_EQ(toAscii(Json("\xFF!")), "\"\\ufffd!\"");
}

TEST(Text, LongValuesAreCut) {
    EXPECT_EQ(shown(Json(std::string(500, 'x'))), "\"" + std::string(59, 'x') + "...");
    EXPECT_EQ(shown(Json(12)), "12");
}

TEST(Text, OctetsThatAreNotUtf8AreNoticed) {
    EXPECT_TRUE(isUtf8("gr\xC3\xBC\xC3\x9F"));
    EXPECT_FALSE(isUtf8("\xFF"));
    EXPECT_FALSE(isUtf8("\xC3"));
}
