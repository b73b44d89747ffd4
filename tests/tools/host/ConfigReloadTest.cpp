#include "ConfigReload.h"

#include <filesystem>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Tool.h"

using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;
using vantelhost::canReread;
using vantelhost::ConfigChange;
using vantelhost::Json;
using vantelhost::Settings;

namespace {

/// A run with a configuration file.
class ConfigReloadTest : public testing::Test {
protected:
    void begin(const std::string& text, const Words& more = {}) {
        words.insert(words.end(), more.begin(), more.end());
        writeFile(path, text);
        inUse = vantelhost::readRunConfig(words);
        settings = completeSettings(schema, userSettings(inUse.options, inUse.json)).values;
    }

    ConfigChange reread() const { return vantelhost::rereadConfig(words, inUse, schema, settings); }

    ConfigChange reread(const std::string& text) const {
        writeFile(path, text);
        return reread();
    }

    static void expectNothing(const ConfigChange& change) {
        EXPECT_THAT(change.errors, IsEmpty());
        EXPECT_THAT(change.warnings, IsEmpty());
        EXPECT_THAT(change.startOnly, IsEmpty());
        EXPECT_EQ(change.settings, std::nullopt);
    }

    const vantelhost::Schema schema = vantelhost::parseSchema(R"({
        "count": {"dataType": "int", "range": [0, 10], "default": 7},
        "flag": {"dataType": "bool", "default": false}})");
    const Folder folder;
    const std::string path = folder.path("a.toml");
    Words words{"--config", path};
    vantelhost::RunConfig inUse;
    Json settings;
};

} // namespace

TEST_F(ConfigReloadTest, TheSameFileChangesNothing) {
    begin("interface = \"a\"\nseconds = 5\n[settings]\ncount = 1\n");
    expectNothing(reread());
    expectNothing(reread("# new comment\nseconds=5\ninterface = [\"a\"]\njson = false\n"
                         "[settings]\nflag = false\ncount = 1\n"));
}

TEST_F(ConfigReloadTest, NewSettingsAreComplete) {
    begin("interface = \"a\"\n[settings]\ncount = 1\n");
    const auto change = reread("interface = [\"a\", \"b\"]\n[settings]\nflag = true\n");
    EXPECT_THAT(change.errors, IsEmpty());
    EXPECT_THAT(change.startOnly, IsEmpty());
    EXPECT_EQ(change.settings, Json({{"count", 7}, {"flag", true}, {"interface", {"a", "b"}}}));
}

TEST_F(ConfigReloadTest, WhatTheCommandLineSaysStays) {
    begin("seconds = 5\n[settings]\ncount = 1\n",
          {"--interface", "a", "--seconds", "6", "--set", "count=2"});
    EXPECT_EQ(settings["count"], 2);
    expectNothing(reread("seconds = 7\ninterface = \"b\"\n[settings]\ncount = 3\n"));
}

TEST_F(ConfigReloadTest, WhatAnOptionNeedsMayStandBelowItOrOnTheCommandLine) {
    begin("interface = \"a\"\nrecord-append = true\nrecord = \"r\"\n");
    expectNothing(reread());
    words.insert(words.end(), {"--record", "mine"});
    begin("interface = \"a\"\nrecord-append = true\n");
    expectNothing(reread());
}

TEST_F(ConfigReloadTest, OtherOptionsNeedANewStart) {
    begin("interface = \"a\"\nseconds = 5\nrecord = \"r\"\njson = true\n");
    const auto change = reread("interface = \"a\"\nseconds = 6\nchrony = \"c\"\njson = true\n");
    EXPECT_THAT(change.startOnly, ElementsAre("chrony", "record", "seconds"));
    EXPECT_EQ(change.settings, std::nullopt);
}

TEST_F(ConfigReloadTest, ABadFileChangesNothing) {
    begin("interface = \"a\"\nseconds = 5\n[settings]\ncount = 1\n");
    for (const auto& [text, problem] : {
             std::pair("interface = \"b\"\nseconds = soon\n", ":2: seconds: must be a number of "),
             std::pair("interface = \"b\"\nnonsense = 1\n", ":2: nonsense: is unknown"),
             std::pair("interface = \"b\"\n[settings]\ncount = 11\n", ":3: count: 11 is out of"),
             std::pair("seconds = 6\n", "interface: is missing"),
             std::pair("{\"count\": }", ":1: "),
         }) {
        const auto change = reread(text);
        ASSERT_THAT(change.errors, testing::SizeIs(1)) << text;
        EXPECT_THAT(change.errors[0], testing::HasSubstr(problem));
        EXPECT_EQ(change.settings, std::nullopt);
        EXPECT_THAT(change.startOnly, IsEmpty());
    }
}

TEST_F(ConfigReloadTest, AFileThatIsGoneChangesNothing) {
    begin("interface = \"a\"\n");
    std::filesystem::remove(path);
    EXPECT_THAT(reread().errors, ElementsAre(StartsWith("cannot read " + path)));
}

TEST_F(ConfigReloadTest, JsonIsReadAgainToo) {
    begin(R"({"interface": ["a"], "count": 1})");
    expectNothing(reread());
    const auto change = reread(R"({"interface": ["a"], "count": 2, "other": 3})");
    EXPECT_THAT(change.warnings, ElementsAre(StartsWith(path + ":1: other: is unknown")));
    EXPECT_EQ(change.settings.value()["count"], 2);
}

TEST_F(ConfigReloadTest, OnlyAFileCanBeReadAgain) {
    vantelhost::RunOptions options;
    EXPECT_FALSE(canReread(options));
    options.configFile = "-";
    EXPECT_FALSE(canReread(options));
    options.configFile = "a";
    EXPECT_TRUE(canReread(options));
}

TEST(RereadEvent, TellsWhatIsDone) {
    const auto same = vantelhost::rereadEvent({});
    EXPECT_EQ(same.name, "reread");
    EXPECT_EQ(same.text, "the settings are the same");
    EXPECT_EQ(same.members.dump(), R"({"changed":false,"startOnly":[],"problems":[]})");
    const auto changed = vantelhost::rereadEvent({{}, {}, Json::object(), {"json", "record"}});
    EXPECT_EQ(changed.text,
              "the plug-in gets new settings; changed, but needs a new start: json, record");
    EXPECT_EQ(changed.members.dump(),
              R"({"changed":true,"startOnly":["json","record"],"problems":[]})");
    const auto refused = vantelhost::rereadEvent({{"a:1: b", "a:2: c"}, {}, std::nullopt, {}});
    EXPECT_EQ(refused.text, "refused, all stays as it was: a:1: b; a:2: c");
    EXPECT_EQ(refused.members["problems"], Json({"a:1: b", "a:2: c"}));
}
