#include "OptionWords.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

struct Sample {
    std::string text;
    std::vector<std::string> list;
    int number = 7;
    bool flag = false;
    bool other = false;
    bool kept = false;
    std::string needed;
    int needing = 0;
};

void addSample(CLI::App& command, Sample& sample) {
    command.add_option("--text", sample.text, "");
    command.add_option("--list", sample.list, "")->expected(1)->take_all();
    command.add_option("-n,--number", sample.number, "");
    auto* flag = command.add_flag("--flag", sample.flag, "");
    command.add_flag("--other", sample.other, "")->excludes(flag);
    command.add_flag("--kept", sample.kept, "")->configurable(false);
    auto* needed = command.add_option("--needed", sample.needed, "");
    command.add_option("--needing", sample.needing, "")->needs(needed);
}

/// A command with the words read.
struct Read : ParsedOptions<Sample> {
    explicit Read(const Words& words) : ParsedOptions(words, addSample) {}
};

ConfigEntry single(const std::string& key, const std::string& value) {
    return {key, {value}, false, 3, "a.toml:3"};
}

ConfigEntry several(const std::string& key, const std::vector<std::string>& values) {
    return {key, values, true, 4, "a.toml:4"};
}

std::vector<std::string> complaintsOf(const std::vector<ConfigEntry>& entries,
                                      const Words& commandLine = {}) {
    const Read read(commandLine);
    std::vector<std::string> texts;
    for (const auto& complaint :
         complaintsAbout(entries, read.command, [](const Words& words) { Read{words}; })) {
        texts.push_back(complaint.text);
    }
    return texts;
}

} // namespace

TEST(OptionWords, SayWhatACommandGot) {
    EXPECT_THAT(wordsOf(Read({}).command), IsEmpty());
    EXPECT_THAT(wordsOf(Read({"--list=--b", "--flag", "--list", "c", "-n", "-5"}).command),
                ElementsAre("--list", "--b", "--list", "c", "--number", "-5", "--flag"));
    EXPECT_THAT(wordsOf(Read({"--flag=false"}).command), IsEmpty());
}

TEST(OptionWords, ReadAgainGiveTheSame) {
    const Words words = wordsOf(Read({"--list=--b", "--text=-x", "--number=-5", "--flag"}).command);
    const Sample sample = Read(words).options;
    EXPECT_THAT(sample.list, ElementsAre("--b"));
    EXPECT_EQ(sample.text, "-x");
    EXPECT_EQ(sample.number, -5);
    EXPECT_TRUE(sample.flag);
}

TEST(OptionWords, AFileAddsWhatTheCommandLineDoesNotGive) {
    const Read read({"--text", "mine"});
    EXPECT_THAT(wordsToAdd(read.command, {single("text", "its"), several("list", {"a", "b"}),
                                          single("flag", "true")}),
                ElementsAre("--list", "a", "--list", "b", "--flag"));
}

TEST(OptionWords, AFileAddsNothingThatTheCommandLineExcludes) {
    const Read read({"--other"});
    EXPECT_THAT(wordsToAdd(read.command, {single("flag", "true")}), IsEmpty());
}

TEST(OptionWords, AFileAddsOnlyWhatTheCommandTakesFromIt) {
    const Read read({});
    EXPECT_THAT(wordsToAdd(read.command, {single("kept", "true"), single("unknown", "1"),
                                          single("flag", "false"), several("list", {})}),
                ElementsAre());
}

TEST(OptionWords, GoodEntriesAreNotComplainedAbout) {
    EXPECT_THAT(
        complaintsOf({single("text", "--x"), several("list", {"a", "b"}), single("number", "-3"),
                      single("flag", "true"), single("other", "false")}),
        IsEmpty());
    EXPECT_THAT(complaintsOf({several("list", {}), single("text", "")}), IsEmpty());
    EXPECT_THAT(complaintsOf({single("list", "a")}), IsEmpty());
}

TEST(OptionWords, BadEntriesAreNamedWithTheirPlace) {
    EXPECT_THAT(complaintsOf({single("texts", "a")}),
                ElementsAre("a.toml:3: texts: is unknown: no option of \"run\"; settings stand "
                            "below [settings]"));
    EXPECT_THAT(complaintsOf({single("kept", "true")}),
                ElementsAre("a.toml:3: kept: stands on the command line alone"));
    EXPECT_THAT(complaintsOf({several("text", {"a"})}),
                ElementsAre("a.toml:4: text: must be one value, not an array"));
    EXPECT_THAT(complaintsOf({single("flag", "1")}),
                ElementsAre("a.toml:3: flag: must be true or false, not \"1\""));
    EXPECT_THAT(complaintsOf({several("flag", {"true"})}),
                ElementsAre("a.toml:4: flag: must be true or false, not \"true\""));
    EXPECT_THAT(complaintsOf({single("number", "many")}),
                ElementsAre(testing::StartsWith("a.toml:3: number: ")));
    EXPECT_THAT(complaintsOf({single("flag", "true"), single("other", "true")}),
                ElementsAre("a.toml:3: other: excludes flag"));
    EXPECT_THAT(complaintsOf({single("other", "true"), single("flag", "true")}),
                ElementsAre("a.toml:3: flag: excludes other"));
}

TEST(OptionWords, WhatAnEntryNeedsMayStandAnywhere) {
    const auto needing = single("needing", "5");
    const auto needed = single("needed", "x");
    EXPECT_THAT(complaintsOf({needed, needing}), IsEmpty());
    EXPECT_THAT(complaintsOf({needing, needed}), IsEmpty());
    EXPECT_THAT(complaintsOf({needing}, {"--needed", "y"}), IsEmpty());
    EXPECT_THAT(complaintsOf({needing}), ElementsAre("a.toml:3: needing: needs needed"));
    EXPECT_THAT(complaintsOf({needing, several("needed", {"x"})}),
                ElementsAre("a.toml:4: needed: must be one value, not an array"));
    EXPECT_THAT(complaintsOf({single("needing", "many")}),
                ElementsAre(testing::AllOf(testing::StartsWith("a.toml:3: needing: "),
                                           testing::Not(testing::HasSubstr("needs")))));
}
