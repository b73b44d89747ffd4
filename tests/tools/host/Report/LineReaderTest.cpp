#include "Report/LineReader.h"

#include <sstream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace {

/// Each line; "|" behind a whole one, "!" for one that is too long. At most 5 octets fit.
std::vector<std::string> linesOf(const std::string& text) {
    std::istringstream stream(text);
    LineReader reader(stream, 5);
    std::vector<std::string> lines;
    while (const auto line = reader.next()) {
        lines.push_back(std::string(line->text) + (line->isTooLong ? "!" : "") +
                        (line->isWhole ? "|" : ""));
    }
    return lines;
}

} // namespace

TEST(LineReader, LinesOfAnyLengthUpToTheLongestAreGiven) {
    EXPECT_THAT(linesOf("\na\n12345\n\nbc\n"), ElementsAre("|", "a|", "12345|", "|", "bc|"));
}

TEST(LineReader, ALastLineMayHaveNoEnd) {
    EXPECT_THAT(linesOf("a\nbc"), ElementsAre("a|", "bc"));
    EXPECT_THAT(linesOf(""), ElementsAre());
}

TEST(LineReader, WhatIsTooLongIsSkippedToItsEnd) {
    EXPECT_THAT(linesOf("123456\na\n" + std::string(100, 'x') + "\nb\n"),
                ElementsAre("!|", "a|", "!|", "b|"));
    EXPECT_THAT(linesOf("a\n" + std::string(100, 'x')), ElementsAre("a|", "!"));
}

TEST(LineReader, OctetsOfZeroAreOctets) {
    EXPECT_THAT(linesOf(std::string("a\0b\n", 4)), ElementsAre(std::string("a\0b|", 4)));
}
