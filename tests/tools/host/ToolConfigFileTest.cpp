// One file with options and settings, as the commands take it.

#include "Tool.h"
#include "support/Child.h"

using testing::HasSubstr;
using testing::IsEmpty;
using vantelhost::Json;

namespace {

Result vantelHost(Words words, const std::string& input = {}) {
    words.insert(words.begin(), HOST_TOOL);
    Child child(words);
    child.write(input);
    const int status = child.wait();
    return {status, child.output(), child.errors()};
}

std::string shownConfigFile(const Words& options = {}) {
    Words words{"schema", "--config-file", "--library", FAKE_PLUGIN};
    words.insert(words.end(), options.begin(), options.end());
    const Result result = vantelHost(words);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.errors, "");
    return result.output;
}

/// The same with the defaults of options, which are commented out.
std::string withOptions(std::string text) {
    for (const char* key : {"library", "no-interfaces", "json", "plain", "force", "create-fifo",
                            "refuse-while-stopping"}) {
        const auto at = text.find(std::string("\n#") + key + " = ");
        EXPECT_NE(at, std::string::npos) << key;
        text.erase(at + 1, 1);
    }
    return text;
}

} // namespace

TEST_F(ToolTest, AFileCanSayAllOfARun) {
    writeFile(folder.path("a.toml"), "library = \"" FAKE_PLUGIN "\"\ninterface = [\"a\", \"b\"]\n"
                                     "seconds = 0\njson = true\nrecord = \"" +
                                         folder.path("r.jsonl") +
                                         "\"\n[settings]\ncount = 3\ntwoStep = true\n");
    const Result result = vantelHost({"run", "--config", folder.path("a.toml")});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.errors, "");
    const Json configuration = result.events("initialised").at(0)["configuration"];
    EXPECT_EQ(configuration["interface"], Json({"a", "b"}));
    EXPECT_EQ(configuration["count"], 3);
    EXPECT_EQ(configuration["twoStep"], true);
    EXPECT_EQ(contentOf(folder.path("r.jsonl")), result.output);
}

TEST_F(ToolTest, TheCommandLineWinsOverAFileOfOptions) {
    ASSERT_EQ(
        run({"--config", "-", "--interface", "c", "--seconds", "0", "--set", "count=4"},
            "interface = [\"a\"]\nseconds = 1000\nlibrary = \"/none\"\n[settings]\ncount = 3\n"
            "wide = 5\n")
            .status,
        0);
    EXPECT_EQ(configuration()["interface"], Json::array({"c"}));
    EXPECT_EQ(configuration()["count"], 4);
    EXPECT_EQ(configuration()["wide"], 5);
}

TEST_F(ToolTest, BadSettingsOfAFileOfOptionsNameTheirLine) {
    struct Row {
        const char* setting;
        const char* complaint;
    };
    for (const auto& row : {
             Row{"count = 101", "2: count: 101 is out of range, -5 to 100 is allowed"},
             Row{"count = seven", "2: count: must be an integer, not \"seven\""},
             Row{"count = 1.5", "2: count: must be an integer, not \"1.5\""},
             Row{"count = [1]", "2: count: must be an integer, not [\"1\"]"},
             Row{"twoStep = yes", "2: twoStep: must be true or false, not \"yes\""},
             Row{"script = []", "2: script: must be a string, not []"},
             Row{"TwoStep = true", "2: TwoStep: is unknown to the plug-in (\"twoStep\" is meant?)"},
             Row{"other = 1", "2: other: is unknown to the plug-in\n"},
             Row{"interface = \"b\"", "2: interface: is no setting but an option"},
         }) {
        const auto result = run({"--config", "-", "--seconds", "0", "--interface", "a"},
                                std::string("[settings]\n") + row.setting + "\n");
        EXPECT_EQ(result.status, 2) << row.setting;
        EXPECT_THAT(result.errors,
                    HasSubstr(std::string("vantel-host: the standard input:") + row.complaint));
        EXPECT_THAT(record(), IsEmpty()) << row.setting;
    }
}

TEST_F(ToolTest, BadOptionsOfAFileNameTheirLineAndNothingIsLoaded) {
    writeFile(folder.path("a.toml"), "interface = a\nsecond = 1\njson = maybe\n");
    const auto result = vantelHost({"run", "--config", folder.path("a.toml")});
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.errors, "vantel-host: " + folder.path("a.toml") +
                                 ":2: second: is unknown: no option of \"run\"; settings stand "
                                 "below [settings]\nvantel-host: " +
                                 folder.path("a.toml") +
                                 ":3: json: must be true or false, not \"maybe\"\n"
                                 "vantel-host: nothing is done with a bad configuration file\n");
}

TEST_F(ToolTest, CheckTakesTheFileOfARun) {
    const std::string text = "library = \"" FAKE_PLUGIN "\"\ninterface = [\"none0\"]\nseconds = 5\n"
                             "json = true\nfifo = \"" +
                             folder.path("f") + "\"\n[settings]\ncount = 3\n";
    const Result good = vantelHost({"check", "--config", "-"}, text);
    EXPECT_EQ(good.status, 1);
    EXPECT_THAT(good.output, HasSubstr("ok    settings "));
    EXPECT_THAT(good.output, HasSubstr("FAIL  interface none0 "));
    EXPECT_THAT(good.output, HasSubstr(folder.path("f")));
    const Result other = vantelHost({"check", "--config", "-", "--interface", "none1"}, text);
    EXPECT_THAT(other.output, HasSubstr("FAIL  interface none1 "));
    const Result bad = vantelHost({"check", "--config", "-"}, text + "count = 4\nother = 1\n");
    EXPECT_EQ(bad.status, 2);
    EXPECT_THAT(bad.errors, HasSubstr("vantel-host: the standard input:8: count: is given twice"));
    const Result setting = vantelHost({"check", "--config", "-"}, text + "other = 1\n");
    EXPECT_EQ(setting.status, 1);
    EXPECT_THAT(setting.output, HasSubstr("the standard input:8: other: is unknown"));
}

TEST_F(ToolTest, TheShownConfigFileChangesNothing) {
    ASSERT_EQ(play("").status, 0);
    const Json defaults = configuration();
    for (const auto& text : {shownConfigFile(), withOptions(shownConfigFile())}) {
        writeFile(folder.path("a.toml"), text);
        writeFile(folder.path("record"), "");
        const Result result =
            run({"--config", folder.path("a.toml"), "--interface", "eth0", "--seconds", "0"});
        EXPECT_EQ(result.status, 0);
        EXPECT_EQ(result.errors, "");
        EXPECT_EQ(configuration(), defaults);
    }
}

TEST_F(ToolTest, TheShownConfigFileNeedsOnlyAnInterface) {
    std::string text = shownConfigFile();
    const std::string line = "\n#interface = [\"NAME\"]\n";
    const auto at = text.find(line);
    ASSERT_NE(at, std::string::npos);
    writeFile(folder.path("a.toml"), text.replace(at, line.size(), "\ninterface = [\"eth7\"]\n"));
    EXPECT_EQ(run({"--config", folder.path("a.toml"), "--seconds", "0"}).status, 0);
    EXPECT_EQ(configuration()["interface"], Json::array({"eth7"}));
}

TEST_F(ToolTest, TheShownConfigFileOfTheLibraryIsGood) {
    const Result shown = vantelHost({"schema", "--config-file", "--library", VANTEL_BC_LIBRARY});
    ASSERT_EQ(shown.status, 0);
    const Result checked = vantelHost(
        {"check", "--config", "-", "--library", VANTEL_BC_LIBRARY, "--interface", "none0"},
        shown.output);
    EXPECT_EQ(checked.errors, "");
    EXPECT_THAT(checked.output, HasSubstr("ok    settings "));
    EXPECT_THAT(checked.output, HasSubstr("ok    initialise "));
}

TEST(SchemaCommand, ShowsAllOptionsThatAFileMayHave) {
    const std::string text = shownConfigFile();
    const Result help = vantelHost({"run", "--help"});
    std::size_t count = 0;
    for (auto at = help.output.find("\n  --"); at != std::string::npos;
         at = help.output.find("\n  --", at + 1)) {
        const auto begin = at + 5;
        const std::string name =
            help.output.substr(begin, help.output.find_first_of(" \n[", begin) - begin);
        if (name != "config") {
            ++count;
            EXPECT_THAT(text, HasSubstr("\n#" + name + " = "));
        }
    }
    EXPECT_GE(count, 14U);
}
