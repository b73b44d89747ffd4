#include "errors/zesdbg_VarLine.h"

#include <cstdarg>
#include <cwchar>
#include <string>

#include <gtest/gtest.h>

namespace {

/// A line of 7 characters in larger memory that is full of something else.
class VarLineTest : public testing::Test {
protected:
    [[gnu::format(printf, 2, 3)]] void appendFormatted(const char* format, ...) {
        std::va_list arguments;
        va_start(arguments, format);
        line.appendFormatted(format, arguments);
        va_end(arguments);
    }

    std::string behindTheLine() const { return memory.substr(8); }

    std::string memory = '\0' + std::string(31, '#');
    zesdbg_VarLine line{memory.data(), 8};
};

TEST_F(VarLineTest, EndsBehindWhatIsAppended) {
    line.append("ab");
    EXPECT_STREQ(line.text(), "ab");
    appendFormatted("%d", 12);
    EXPECT_STREQ(line.text(), "ab12");
    line.append("c");
    EXPECT_STREQ(line.text(), "ab12c");
}

TEST_F(VarLineTest, WhatIsTooLongIsCutAndNothingFollows) {
    appendFormatted("%s", "abcdefghij");
    EXPECT_STREQ(line.text(), "abcdefg");
    line.append("k");
    appendFormatted("%s", "l");
    EXPECT_STREQ(line.text(), "abcdefg");
    EXPECT_EQ(behindTheLine(), std::string(24, '#'));
}

TEST_F(VarLineTest, WhatCannotBeFormattedAddsNothing) {
    appendFormatted("%lc", static_cast<std::wint_t>(0x7fffffff));
    line.append("a");
    EXPECT_STREQ(line.text(), "a");
}

} // namespace
