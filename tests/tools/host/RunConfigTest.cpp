#include "RunConfig.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Tool.h"

using testing::ElementsAre;
using testing::IsEmpty;
using vantelhost::readRunConfig;
using vantelhost::RunConfig;

namespace {

/// The configuration of a file and more words.
class RunConfigTest : public testing::Test {
protected:
    RunConfig read(const std::string& text, Words words = {}) const {
        writeFile(path, text);
        words.insert(words.begin(), {"--config", path});
        return readRunConfig(words);
    }

    const Folder folder;
    const std::string path = folder.path("a.toml");
};

} // namespace

TEST_F(RunConfigTest, AFileGivesAllKindsOfOptions) {
    const auto config = read("interface = [\"a\", \"b\"]\nseconds = 2.5\njson = true\n"
                             "epoch-offset = -6\nepoch-offset-at = [\"2:20\", \"1:-10\"]\n"
                             "chrony = \"/run/c.sock\"\n[settings]\ncount = 1\n");
    EXPECT_THAT(config.errors, IsEmpty());
    const auto& options = config.options;
    EXPECT_THAT(options.interfaces, ElementsAre("a", "b"));
    EXPECT_EQ(options.seconds, 2.5);
    EXPECT_TRUE(options.jsonLines && options.useFifo);
    EXPECT_EQ(options.epochOffset, -6);
    ASSERT_EQ(options.timedOffsets.size(), 2U);
    EXPECT_EQ(options.timedOffsets[0].nanoseconds, -10);
    EXPECT_EQ(options.chronySocket, "/run/c.sock");
    ASSERT_EQ(options.fileSettings.size(), 1U);
    EXPECT_EQ(options.fileSettings[0].place, path + ":8");
}

TEST_F(RunConfigTest, TheCommandLineWins) {
    const auto config = read("interface = \"a\"\nseconds = 2\njson = true\n",
                             {"--interface", "b", "--seconds", "3", "--plain"});
    EXPECT_THAT(config.errors, IsEmpty());
    EXPECT_THAT(config.options.interfaces, ElementsAre("b"));
    EXPECT_EQ(config.options.seconds, 3.0);
    EXPECT_TRUE(config.options.plain);
    EXPECT_FALSE(config.options.jsonLines);
}

TEST_F(RunConfigTest, TheOrderOfOptionsThatNeedEachOtherIsOfNoAccount) {
    const auto config =
        read("record-keep = 3\nrecord-size = \"1K\"\nrecord-append = true\nrecord = \"r\"\n");
    EXPECT_THAT(config.errors, IsEmpty());
    EXPECT_EQ(config.options.recordFile, "r");
    EXPECT_TRUE(config.options.recordRules.append);
    EXPECT_EQ(config.options.recordRules.size, 1024U);
    EXPECT_EQ(config.options.recordRules.keep, 3U);
}

TEST_F(RunConfigTest, WhatAFileNeedsMayStandOnTheCommandLine) {
    const std::string text = "record-append = true\nrecord-size = 100\n";
    const auto config = read(text, {"--record", "mine"});
    EXPECT_THAT(config.errors, IsEmpty());
    EXPECT_EQ(config.options.recordFile, "mine");
    EXPECT_TRUE(config.options.recordRules.append);
    EXPECT_THAT(read(text).errors, ElementsAre(path + ":1: record-append: needs record",
                                               path + ":2: record-size: needs record"));
}

TEST_F(RunConfigTest, AFileThatTheCommandLineOverridesMustBeGoodToo) {
    EXPECT_THAT(read("seconds = soon", {"--seconds", "3"}).errors,
                ElementsAre(path + ":1: seconds: must be a number of seconds, not \"soon\""));
}

TEST_F(RunConfigTest, ErrorsComeInTheOrderOfLines) {
    EXPECT_THAT(read("nonsense = 1\njson\nconfig = \"x\"\n").errors,
                ElementsAre(path + ":1: nonsense: is unknown: no option of \"run\"; settings "
                                   "stand below [settings]",
                            path + ":2: must be key = value, not \"json\"",
                            path + ":3: config: stands on the command line alone"));
}

TEST_F(RunConfigTest, AssignmentsOfAFileAreSettingsWithTheirLine) {
    const auto config = read("\nset = [\"count=1\", \"script=a=b\"]\n", {"--set", "count=2"});
    EXPECT_THAT(config.errors, IsEmpty());
    ASSERT_EQ(config.options.fileSettings.size(), 2U);
    EXPECT_EQ(config.options.fileSettings[1].key, "script");
    EXPECT_THAT(config.options.fileSettings[1].values, ElementsAre("a=b"));
    EXPECT_EQ(config.options.fileSettings[1].place, path + ":2");
    EXPECT_THAT(config.options.assignments, ElementsAre("count=2"));
    EXPECT_THAT(read("set = \"count\"").errors,
                ElementsAre(path + ":1: set: must be \"key=value\", not \"count\""));
}

TEST_F(RunConfigTest, AJsonObjectIsLeftToTheSettings) {
    const auto config = read(" {\"count\": 1}", {"--interface", "a"});
    EXPECT_THAT(config.errors, IsEmpty());
    EXPECT_EQ(config.json, " {\"count\": 1}");
    EXPECT_THAT(config.options.interfaces, ElementsAre("a"));
    EXPECT_EQ(config.options.configFile, path);
}

TEST_F(RunConfigTest, WithoutAFileTheCommandLineIsAll) {
    const auto config = readRunConfig({"--interface", "a"});
    EXPECT_THAT(config.errors, IsEmpty());
    EXPECT_EQ(config.json, std::nullopt);
    EXPECT_THAT(config.options.interfaces, ElementsAre("a"));
}
