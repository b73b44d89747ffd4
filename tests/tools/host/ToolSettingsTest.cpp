// Where settings come from, and what is said about bad ones.

#include "Tool.h"

using testing::HasSubstr;
using testing::IsEmpty;
using vantelhost::Json;

namespace {

constexpr char interfaces[] = R"({"interface":["a","b"],"count":3,"twoStep":true})";

} // namespace

TEST_F(ToolTest, SettingsComeFromAFile) {
    writeFile(folder.path("config"), interfaces);
    ASSERT_EQ(run({"--config", folder.path("config"), "--seconds", "0"}).status, 0);
    EXPECT_EQ(configuration()["interface"], Json({"a", "b"}));
    EXPECT_EQ(configuration()["count"], 3);
    EXPECT_EQ(configuration()["twoStep"], true);
}

TEST_F(ToolTest, SettingsComeFromTheStandardInput) {
    ASSERT_EQ(run({"--config", "-", "--seconds", "0"}, interfaces).status, 0);
    EXPECT_EQ(configuration()["count"], 3);
}

TEST_F(ToolTest, OptionsWinOverTheFile) {
    ASSERT_EQ(run({"--config", "-", "--seconds", "0", "--set", "count=4", "--set", "twoStep=false",
                   "--interface", "c", "--interface", "d"},
                  interfaces)
                  .status,
              0);
    EXPECT_EQ(configuration()["count"], 4);
    EXPECT_EQ(configuration()["twoStep"], false);
    EXPECT_EQ(configuration()["interface"], Json({"c", "d"}));
}

TEST_F(ToolTest, BadSettingsNameTheirKeyAndNothingIsInitialised) {
    struct Row {
        const char* setting;
        const char* complaint;
    };
    for (const auto& row : {
             Row{R"({"count":101})",
                 "vantel-host: the standard input:1: count: 101 is out of range, -5 to 100"},
             Row{R"({"count":-6})", "vantel-host: the standard input:1: count: -6 is out of range"},
             Row{R"({"wide":4294967296})",
                 "vantel-host: the standard input:1: wide: 4294967296 is out of range"},
             Row{R"({"wide":-1})", "vantel-host: the standard input:1: wide: -1 is out of range"},
             Row{R"({"wide":99999999999999999999999})",
                 "vantel-host: the standard input:1: wide: must be an integer"},
             Row{R"({"count":"7"})",
                 "vantel-host: the standard input:1: count: must be an integer, not \"7\""},
             Row{R"({"count":1.5})",
                 "vantel-host: the standard input:1: count: must be an integer, not 1.5"},
             Row{R"({"count":null})",
                 "vantel-host: the standard input:1: count: must be an integer, not null"},
             Row{R"({"count":[1]})",
                 "vantel-host: the standard input:1: count: must be an integer, not [1]"},
             Row{R"({"twoStep":1})",
                 "vantel-host: the standard input:1: twoStep: must be true or false, not 1"},
             Row{R"({"twoStep":"true"})",
                 "vantel-host: the standard input:1: twoStep: must be true or false"},
             Row{R"({"script":5})",
                 "vantel-host: the standard input:1: script: must be a string, not 5"},
             Row{R"({"script":"a\u0000b"})",
                 "vantel-host: the standard input:1: script: must not contain"},
             Row{R"({"count":1,"count":2})",
                 "vantel-host: the standard input:1: count: is given twice"},
             Row{R"({"interface":"eth0"})",
                 "vantel-host: the standard input:1: interface: must be an array of names"},
             Row{R"({"interface":[]})",
                 "vantel-host: the standard input:1: interface: must name at least one"},
             Row{R"({"interface":[7]})",
                 "vantel-host: the standard input:1: interface: must be an array of names"},
             Row{R"({})", "vantel-host: interface: is missing"},
             Row{R"({"count":)", "vantel-host: the standard input:1: "},
             Row{"", "vantel-host: interface: is missing"},
         }) {
        const auto result = run({"--config", "-", "--seconds", "0"}, row.setting);
        EXPECT_EQ(result.status, 2) << row.setting;
        EXPECT_THAT(result.errors, HasSubstr(row.complaint)) << row.setting;
        EXPECT_THAT(record(), IsEmpty()) << row.setting;
    }
}

TEST_F(ToolTest, BadSettingsOfAFileNameFileAndLine) {
    const std::string path = folder.path("a.json");
    writeFile(path, "{\n \"interface\": [\"a\"],\n \"count\": 101\n}");
    EXPECT_THAT(run({"--config", path}).errors,
                HasSubstr("vantel-host: " + path + ":3: count: 101 is out of range"));
    writeFile(path, "{\n \"count\": \n}");
    EXPECT_THAT(run({"--config", path}).errors, HasSubstr("vantel-host: " + path + ":3: "));
}

TEST_F(ToolTest, BadAssignmentsNameTheirKey) {
    struct Row {
        const char* assignment;
        const char* complaint;
    };
    for (const auto& row : {
             Row{"count=101", "count: 101 is out of range, -5 to 100 is allowed"},
             Row{"count=seven", "count: must be an integer, not \"seven\""},
             Row{"count=", "count: must be an integer, not \"\""},
             Row{"twoStep=yes", "twoStep: must be true or false, not \"yes\""},
             Row{"interface=eth0", "interface: is set with --interface"},
             Row{"count", "count: must be key=value"},
         }) {
        const auto result = run({"--interface", "eth0", "--seconds", "0", "--set", row.assignment});
        EXPECT_EQ(result.status, 2) << row.assignment;
        EXPECT_THAT(result.errors, HasSubstr(row.complaint));
    }
}

TEST_F(ToolTest, AllBadKeysAreNamedAtOnce) {
    const auto result =
        run({"--config", "-", "--set", "count=x"}, R"({"twoStep":2,"interface":[]})");
    EXPECT_EQ(result.status, 2);
    for (const char* key : {"count: ", "twoStep: ", "interface: "}) {
        EXPECT_THAT(result.errors, HasSubstr(key));
    }
}

TEST_F(ToolTest, TheEndsOfARangeAreAllowed) {
    EXPECT_EQ(play("", {"--set", "count=-5", "--set", "wide=0"}).status, 0);
    EXPECT_EQ(play("", {"--set", "count=100", "--set", "wide=4294967295"}).status, 0);
}

TEST_F(ToolTest, UnknownKeysAreWarnedOfAndPassedOn) {
    const auto result = run({"--config", "-", "--seconds", "0"},
                            R"({"interface":["a"],"other":{"x":[1]},"TwoStep":true})");
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.errors,
                HasSubstr("vantel-host: warning: the standard input:1: other: is unknown"));
    EXPECT_THAT(
        result.errors,
        HasSubstr(
            "warning: the standard input:1: TwoStep: is unknown to the plug-in (\"twoStep\""));
    EXPECT_EQ(configuration()["other"].dump(), R"({"x":[1]})");
    EXPECT_EQ(configuration()["twoStep"], false);
}

TEST_F(ToolTest, NoInterfacesGivesAnEmptyArray) {
    EXPECT_EQ(run({"--no-interfaces", "--seconds", "0"}).status, 0);
    EXPECT_EQ(configuration()["interface"], Json::array());
}

TEST_F(ToolTest, AFileThatCannotBeReadIsNamed) {
    for (const auto& path : {folder.path("none"), folder.path("")}) {
        const auto result = run({"--config", path, "--seconds", "0"});
        EXPECT_EQ(result.status, 2);
        EXPECT_THAT(result.errors, HasSubstr("cannot read " + path));
    }
}
