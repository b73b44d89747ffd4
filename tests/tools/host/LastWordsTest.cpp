#include "LastWords.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "Tool.h"
#include "WriteAll.h"

using namespace vantelhost;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

/// As a child does that inherits it.
void say(LastWords& words, const std::string& text) {
    const LastWords::Redirection redirection(words);
    EXPECT_TRUE(writeAll(STDERR_FILENO, text));
}

} // namespace

TEST(LastWords, TheLastLinesAreKept) {
    LastWords words(-1);
    say(words, "one\ntwo\n\n \nthree\nfour");
    words.take();
    EXPECT_THAT(words.lines(), ElementsAre("two", "three", "four"));
}

TEST(LastWords, TheStandardErrorIsAsItWasAfterwards) {
    testing::internal::CaptureStderr();
    LastWords words(-1);
    say(words, "of the child\n");
    EXPECT_TRUE(writeAll(STDERR_FILENO, "mine\n"));
    words.take();
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "mine\n");
}

TEST(LastWords, TheyArePassedOn) {
    const Folder folder;
    const std::string path = folder.path("errors");
    const int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    LastWords words(file);
    say(words, "one\ntwo\n");
    words.take();
    EXPECT_EQ(contentOf(path), "one\ntwo\n");
    ::close(file);
}

TEST(LastWords, WithoutAWriterNothingIsWaitedFor) {
    LastWords words(-1);
    EXPECT_EQ(words.descriptor(), -1);
    words.take();
    say(words, "");
    EXPECT_GE(words.descriptor(), 0);
    words.take();
    EXPECT_EQ(words.descriptor(), -1);
    EXPECT_THAT(words.lines(), IsEmpty());
}

TEST(LastWords, OfMuchTheEndIsKept) {
    LastWords words(-1);
    say(words, std::string(600000, 'x') + "\nthe end\n");
    words.take();
    EXPECT_EQ(words.lines().back(), "the end");
    EXPECT_LE(words.lines().front().size(), 2000U);
}
