#include "ConfigFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

using Texts = std::vector<std::string>;

ConfigFile readConfigText(const std::string& text) {
    return readConfigFile(text, "a.toml");
}

Texts errorsIn(const std::string& text) {
    Texts errors;
    for (const auto& error : readConfigText(text).errors) {
        errors.push_back(error.text);
    }
    return errors;
}

/// The values of the only option of a text without mistakes.
Texts valuesIn(const std::string& text) {
    const ConfigFile file = readConfigText(text);
    EXPECT_THAT(errorsIn(text), IsEmpty()) << text;
    EXPECT_EQ(file.options.size(), 1U) << text;
    return file.options.empty() ? Texts() : file.options[0].values;
}

} // namespace

TEST(ConfigFile, OptionsStandAboveTheSettings) {
    const ConfigFile file = readConfigText("json = true\nfifo = \"f\"\n\n[settings]\ncount = 5\n");
    ASSERT_EQ(file.options.size(), 2U);
    EXPECT_EQ(file.options[0].key, "json");
    EXPECT_THAT(file.options[0].values, ElementsAre("true"));
    EXPECT_EQ(file.options[1].key, "fifo");
    EXPECT_EQ(file.options[1].place, "a.toml:2");
    ASSERT_EQ(file.settings.size(), 1U);
    EXPECT_EQ(file.settings[0].key, "count");
    EXPECT_THAT(file.settings[0].values, ElementsAre("5"));
    EXPECT_EQ(file.settings[0].line, 5U);
    EXPECT_EQ(file.settings[0].place, "a.toml:5");
}

TEST(ConfigFile, AnEmptyOneSaysNothing) {
    for (const char* text : {"", "\n", "# all\n  # comments", "[settings]", "\r\n"}) {
        const ConfigFile file = readConfigText(text);
        EXPECT_TRUE(file.options.empty() && file.settings.empty() && file.errors.empty()) << text;
    }
}

TEST(ConfigFile, ATextIsWhatStandsBetweenItsQuotes) {
    EXPECT_THAT(valuesIn("a = \"b c\""), ElementsAre("b c"));
    EXPECT_THAT(valuesIn("a = 'b c'"), ElementsAre("b c"));
    EXPECT_THAT(valuesIn("a=\"\""), ElementsAre(""));
    EXPECT_THAT(valuesIn("a = \"b # no comment\" # one"), ElementsAre("b # no comment"));
    EXPECT_THAT(valuesIn("a = \"b, c; d = [e]\""), ElementsAre("b, c; d = [e]"));
    EXPECT_THAT(valuesIn("a = 'say \"b\"'"), ElementsAre("say \"b\""));
    EXPECT_THAT(valuesIn("a = \"it's\""), ElementsAre("it's"));
    EXPECT_THAT(valuesIn("a = 'b\\c\\n'"), ElementsAre("b\\c\\n"));
    EXPECT_THAT(valuesIn("a = \" b \""), ElementsAre(" b "));
    EXPECT_THAT(valuesIn("a = \"z\xC3\xBCrich\""), ElementsAre("z\xC3\xBCrich"));
    EXPECT_THAT(valuesIn("a = \"{}\""), ElementsAre("{}"));
    EXPECT_THAT(valuesIn("a = \"[]\""), ElementsAre("[]"));
    EXPECT_THAT(valuesIn("a = \"`b c`\""), ElementsAre("`b c`"));
}

TEST(ConfigFile, WordsAndNumbersNeedNoQuotes) {
    EXPECT_THAT(valuesIn("a = true"), ElementsAre("true"));
    EXPECT_THAT(valuesIn("a = -5"), ElementsAre("-5"));
    EXPECT_THAT(valuesIn("a=1"), ElementsAre("1"));
    EXPECT_THAT(valuesIn("a = 2.50 # half"), ElementsAre("2.50"));
    EXPECT_THAT(valuesIn("a = 01:80:C2:00:00:0E"), ElementsAre("01:80:C2:00:00:0E"));
    EXPECT_THAT(valuesIn("a = /run/x_y.sock\r"), ElementsAre("/run/x_y.sock"));
}

TEST(ConfigFile, AnArrayHoldsAnyNumberOfValues) {
    EXPECT_THAT(valuesIn("a = []"), IsEmpty());
    EXPECT_THAT(valuesIn("a = [ ]"), IsEmpty());
    EXPECT_THAT(valuesIn("a = [b]"), ElementsAre("b"));
    EXPECT_THAT(valuesIn("a = [\"b c\" , 'd,e',f]"), ElementsAre("b c", "d,e", "f"));
    EXPECT_THAT(valuesIn("a = [\"\", \"b\"]"), ElementsAre("", "b"));
    EXPECT_TRUE(readConfigText("a = [b]").options.at(0).isArray);
    EXPECT_FALSE(readConfigText("a = b").options.at(0).isArray);
}

TEST(ConfigFile, AnArrayMayGoOverLinesAndStandsInItsFirst) {
    const ConfigFile file =
        readConfigText("a = [ # ] no end\n  \"b\",\n\n  # \"c\",\n  'd'\n  ,\n]\ne = 1");
    ASSERT_EQ(file.options.size(), 2U);
    EXPECT_THAT(file.options[0].values, ElementsAre("b", "d"));
    EXPECT_EQ(file.options[0].line, 1U);
    EXPECT_EQ(file.options[1].line, 8U);
    EXPECT_THAT(file.errors, IsEmpty());
}

TEST(ConfigFile, MistakesAreToldWithTheirLine) {
    struct Row {
        const char* text;
        const char* error;
    };
    for (const auto& row : {
             Row{"\na", "a.toml:2: must be key = value, not \"a\""},
             Row{"= 5", "a.toml:1: must be key = value, not \"= 5\""},
             Row{"a b = 5", "a.toml:1: must be key = value, not \"a b = 5\""},
             Row{"a.b = 5", "a.toml:1: must be key = value, not \"a.b = 5\""},
             Row{"a =", "a.toml:1: a: has no value"},
             Row{"a = # b", "a.toml:1: a: has no value"},
             Row{"a = \"b", "a.toml:1: a: a quote \" is not closed"},
             Row{"a = 'b\nc = 5", "a.toml:1: a: a quote ' is not closed"},
             Row{"a = \"b\\c\"", "a.toml:1: a: a text with a backslash stands in single quotes"},
             Row{"a = b c", "a.toml:1: a: an unexpected \"c\""},
             Row{"a = \"b\"c", "a.toml:1: a: an unexpected \"c\""},
             Row{"a = b\"c\"", "a.toml:1: a: an unexpected \"\\\"\""},
             Row{"a = b, c", "a.toml:1: a: an unexpected \",\""},
             Row{"a = {b = 1}", "a.toml:1: a: an unexpected \"{\""},
             Row{"a = \"\"\"b\"\"\"", "a.toml:1: a: an unexpected \"\\\"\""},
             Row{"a = [b", "a.toml:1: a: the array is not closed"},
             Row{"a = [b\nc]", "a.toml:2: a: an unexpected \"c\""},
             Row{"a = [b]]", "a.toml:1: a: an unexpected \"]\""},
             Row{"a = [[b]]", "a.toml:1: a: an unexpected \"[\""},
             Row{"a = [,b]", "a.toml:1: a: an unexpected \",\""},
             Row{"a = [b,,c]", "a.toml:1: a: an unexpected \",\""},
             Row{"a = 1\nb = 2\na = 3", "a.toml:3: a: is given twice, first in line 1"},
             Row{"a = 1\na = 1", "a.toml:2: a: is given twice, first in line 1"},
             Row{"[settings]\na = 1\n\na = 3", "a.toml:4: a: is given twice, first in line 2"},
             Row{"[settings]\n[settings]", "a.toml:2: [settings]: is given twice, first in line 1"},
             Row{"[other]\na = 1", "a.toml:1: [other]: there is no such section, only [settings]"},
             Row{"[settings", "a.toml:1: [settings: there is no such section, only [settings]"},
             Row{"[[settings]]",
                 "a.toml:1: [[settings]]: there is no such section, only [settings]"},
             Row{"a = \"\x01\"", "a.toml:1: is not text in UTF-8"},
             Row{"a = \"\xFF\"", "a.toml:1: is not text in UTF-8"},
             Row{"# \xFF", "a.toml:1: is not text in UTF-8"},
         }) {
        EXPECT_THAT(errorsIn(row.text), ElementsAre(row.error)) << row.text;
    }
}

TEST(ConfigFile, ASettingMayHaveTheNameOfAnOption) {
    const ConfigFile file = readConfigText("a = 1\n[settings]\na = 2");
    EXPECT_THAT(file.errors, IsEmpty());
    EXPECT_THAT(file.options.at(0).values, ElementsAre("1"));
    EXPECT_THAT(file.settings.at(0).values, ElementsAre("2"));
}

TEST(ConfigFile, LongLinesAreRead) {
    const std::string large(1000000, 'x');
    EXPECT_THAT(valuesIn("a = \"" + large + "\""), ElementsAre(large));
}

TEST(ConfigFile, IsJsonWhenItBeginsWithABrace) {
    EXPECT_TRUE(isJsonText("{}"));
    EXPECT_TRUE(isJsonText(" \t\r\n{"));
    for (const char* text : {"", "  ", "[]", "# {}", "a = 1"}) {
        EXPECT_FALSE(isJsonText(text)) << text;
    }
}
