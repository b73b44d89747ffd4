#include "ConfigTemplate.h"

#include <CLI/CLI.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ConfigFile.h"

using namespace vantelhost;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

std::string templateOf(const CLI::App& command, const std::string& schema) {
    return configTemplate(command, parseSchema(schema));
}

} // namespace

TEST(ConfigTemplate, ShowsOptionsCommentedOutBelowTheirMeaning) {
    CLI::App command;
    std::string path = "/a b";
    std::vector<std::string> names;
    int number = 60;
    bool flag = false;
    command.add_option("--path", path, "Some path")->capture_default_str();
    command.add_option("--number", number, "Some number")->capture_default_str();
    command.add_option("--name", names, "Names")->type_name("NAME")->expected(1)->take_all();
    command.add_flag("--flag", flag, "A flag");
    command.add_flag("--kept", flag, "Not of files")->configurable(false);
    const std::string text = templateOf(command, "{}");
    EXPECT_THAT(text, HasSubstr("\n# Some path.\n#path = \"/a b\"\n\n# Some number.\n#number = 60\n"
                                "\n# Names.\n#name = [\"NAME\"]\n\n# A flag.\n#flag = false\n"));
    EXPECT_THAT(text, testing::Not(HasSubstr("kept")));
}

TEST(ConfigTemplate, ShowsParametersWithDefaultAndMeaning) {
    const CLI::App command;
    EXPECT_THAT(templateOf(command, R"({
        "count": {"dataType": "int", "range": [-5, 100], "default": 7},
        "name": {"dataType": "string", "default": "0x1", "hidden": true},
        "flag": {"dataType": "bool", "default": true}})"),
                HasSubstr("[settings]\n\n# an integer from -5 to 100\ncount = 7\n\n"
                          "# a text; seldom of use\nname = \"0x1\"\n\n"
                          "# true or false\nflag = true\n"));
}

TEST(ConfigTemplate, TextsAreReadAsTheyAre) {
    const CLI::App command;
    const ConfigFile file = readConfigFile(templateOf(command, R"({
        "plain": {"dataType": "string", "default": "a # b"},
        "empty": {"dataType": "string", "default": ""},
        "quotes": {"dataType": "string", "default": "say \"a\\b\""},
        "both": {"dataType": "string", "default": "it's \"a\""},
        "lines": {"dataType": "string", "default": "a\nb"}})"),
                                           "a.toml");
    EXPECT_THAT(file.errors, IsEmpty());
    ASSERT_EQ(file.settings.size(), 3U); // no quotes hold the last two
    EXPECT_THAT(file.settings[0].values, ElementsAre("a # b"));
    EXPECT_THAT(file.settings[1].values, ElementsAre(""));
    EXPECT_THAT(file.settings[2].values, ElementsAre("say \"a\\b\""));
}
