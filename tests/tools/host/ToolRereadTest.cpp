// SIGHUP: the configuration file is read again.

#include <csignal>

#include "Tool.h"
#include "support/Child.h"

using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using vantelhost::Json;

namespace {

constexpr char sessionHasStarted[] = "\"event\":\"started\"";
constexpr char fileWasReread[] = "\"event\":\"reread\"";

class ToolRereadTest : public ToolTest {
protected:
    /// A run with a file of this content.
    Words runWith(const std::string& text, const Words& more = {}) const {
        writeFile(path, text);
        Words words = command({"--json", "--config", path});
        words.insert(words.end(), more.begin(), more.end());
        return words;
    }

    /// Another content is there, and SIGHUP says so.
    void change(const Child& child, const std::string& text) const {
        writeFile(path, text);
        child.signal(SIGHUP);
    }

    static Result end(Child& child) {
        child.signal(SIGTERM);
        const int status = child.wait();
        return {status, child.output(), child.errors()};
    }

    const std::string path = folder.path("a.toml");
};

} // namespace

TEST_F(ToolRereadTest, NewSettingsGetASessionOfTheirOwn) {
    Child child(runWith("interface = \"a\"\n[settings]\ncount = 1\n"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, "interface = [\"a\", \"b\"]\n[settings]\ncount = 2\n");
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted, 2));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.errors, "");
    EXPECT_EQ(result.events("reread").at(0)["changed"], true);
    EXPECT_THAT(result.events("reread").at(0)["problems"], IsEmpty());
    ASSERT_EQ(result.events("initialised").size(), 2U);
    EXPECT_EQ(result.events("initialised")[0]["configuration"]["count"], 1);
    EXPECT_EQ(result.events("initialised")[1]["configuration"]["count"], 2);
    EXPECT_EQ(result.events("initialised")[1]["configuration"]["interface"], Json({"a", "b"}));
    EXPECT_EQ(result.events("restart").at(0)["cause"], "new settings");
    EXPECT_EQ(result.events("restart").at(0)["delay"], 0);
    EXPECT_EQ(result.events("stopping").back()["cause"], "SIGTERM");
}

TEST_F(ToolRereadTest, TheSameFileChangesNothing) {
    Child child(runWith("interface = \"a\"\n[settings]\ncount = 1\n"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, "# the same\ninterface = [\"a\"]\n[settings]\ncount = 1\n");
    ASSERT_TRUE(child.waitForOutput(fileWasReread));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("reread").at(0)["changed"], false);
    EXPECT_EQ(result.events("started").size(), 1U);
}

TEST_F(ToolRereadTest, ABadFileLeavesAllAsItWasAndSaysSo) {
    Child child(runWith("interface = \"a\"\n[settings]\ncount = 1\n"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, "interface = \"b\"\nnonsense = 1\n[settings]\ncount = 2\n");
    ASSERT_TRUE(child.waitForOutput(fileWasReread));
    change(child, "interface = \"b\"\n[settings]\ncount = 101\n");
    ASSERT_TRUE(child.waitForOutput(fileWasReread, 2));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("started").size(), 1U);
    const auto rereads = result.events("reread");
    EXPECT_THAT(std::string(rereads.at(0)["problems"].at(0)),
                HasSubstr(path + ":2: nonsense: is unknown"));
    EXPECT_THAT(std::string(rereads.at(1)["problems"].at(0)),
                HasSubstr(path + ":3: count: 101 is out of range"));
    EXPECT_EQ(rereads.at(1)["changed"], false);
}

TEST_F(ToolRereadTest, OtherOptionsNeedANewStart) {
    Child child(runWith("interface = \"a\"\n"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, "interface = \"a\"\nseconds = 0\nchrony = \"c\"\n");
    ASSERT_TRUE(child.waitForOutput(fileWasReread));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("reread").at(0)["startOnly"], Json({"chrony", "seconds"}));
    EXPECT_EQ(result.events("stopping").at(0)["cause"], "SIGTERM");
}

TEST_F(ToolRereadTest, SettingsThatThePlugInRefusesGiveWayToThoseBefore) {
    Child child(runWith("interface = \"a\"\n[settings]\ncount = 1\n"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, "interface = \"a\"\n[settings]\ncount = 2\nscript = \"initialise-fails\"\n");
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted, 2));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    ASSERT_EQ(result.events("initialised").size(), 2U);
    EXPECT_EQ(result.events("initialised")[1]["configuration"]["count"], 1);
    EXPECT_EQ(result.events("restart").at(1)["cause"],
              "initialise failed: back to the settings before");
}

TEST_F(ToolRereadTest, SettingsThatEndPtp4lGiveWayToThoseBefore) {
    Child child(runWith(R"({"interface": ["a"], "child": "exec sleep 1000"})"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, R"({"interface": ["a"], "child": "exit 3"})");
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted, 3));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("initialised").at(2)["configuration"]["child"], "exec sleep 1000");
    EXPECT_THAT(std::string(result.events("restart").at(1)["cause"]),
                AllOf(HasSubstr("ended with status 3"), EndsWith(": back to the settings before")));
    EXPECT_EQ(result.events("restart").at(1)["delay"], 0);
}

TEST_F(ToolRereadTest, SettingsThatHaveBeenSeenAtWorkStay) {
    Child child(runWith(R"({"interface": ["a"], "child": "exec sleep 1000"})"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, R"({"interface": ["a"], "script": "time", "child": "sleep 1; exit 3"})");
    EXPECT_EQ(child.wait(), 1);
    const Result result{1, child.output(), child.errors()};
    EXPECT_EQ(result.events("initialised").size(), 2U);
}

TEST_F(ToolRereadTest, SettingsThatCannotBePreparedAreRefused) {
    Child child(runWith(R"({"interface": ["a"]})"));
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    change(child, R"({"interface": ["a"], "configFile": "/proc/none/file"})");
    ASSERT_TRUE(child.waitForOutput(fileWasReread));
    const Result result = end(child);
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(std::string(result.events("reread").at(0)["problems"].at(0)),
                HasSubstr("cannot make the folder /proc/none of configFile"));
    EXPECT_EQ(result.events("started").size(), 1U);
}

TEST_F(ToolRereadTest, BetweenSessionsTheNextOneGetsTheNewSettings) {
    Child child(runWith("interface = \"a\"\n[settings]\ncount = 1\n",
                        {"--restart", "--set", "child=exit 3"}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"restart\""));
    change(child, "interface = \"a\"\n[settings]\ncount = 2\n");
    ASSERT_TRUE(child.waitForOutput("\"event\":\"initialised\"", 2));
    const Result result = end(child);
    EXPECT_EQ(result.events("initialised")[1]["configuration"]["count"], 2);
}

TEST_F(ToolRereadTest, TheStandardInputIsNotReadAgain) {
    Words words{"/bin/sh", "-c", "exec \"$0\" \"$@\" </dev/null"};
    for (const auto& word : command({"--json", "--config", "-", "--interface", "a"})) {
        words.push_back(word);
    }
    Child child(words);
    ASSERT_TRUE(child.waitForOutput(sessionHasStarted));
    child.signal(SIGHUP);
    EXPECT_EQ(child.wait(), 0);
    EXPECT_THAT(child.output(), HasSubstr("\"cause\":\"SIGHUP\""));
}
