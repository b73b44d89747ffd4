// Keeps the manual pages and what the programs say with --help in step.

#include <map>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "Roff.h"
#include "contract/NamedTests.h"
#include "support/CommandOutput.h"

namespace {

using Words = std::set<std::string>;

std::string page(const std::string& name) {
    return unescapedRoff(projectFile("docs/man/" + name));
}

Words optionsIn(const std::string& text) {
    static const std::regex option("(?:^|[ ,\"])(--?[a-z][a-z0-9-]*)");
    Words options;
    for (std::sregex_iterator found(text.begin(), text.end(), option), end; found != end; ++found) {
        options.insert((*found)[1]);
    }
    return options;
}

/// The options that a help text lists: those with which a line begins, before their description.
Words helpOptions(const std::string& help) {
    static const std::regex line(R"(\n  (-[^\s,]+(?:, ?-[^\s,]+)?))");
    Words options;
    for (std::sregex_iterator found(help.begin(), help.end(), line), end; found != end; ++found) {
        options.merge(optionsIn((*found)[1]));
    }
    return options;
}

/// The options that a page lists, by the heading of their section: what follows .TP.
std::map<std::string, Words> listedOptions(const std::string& page) {
    std::map<std::string, Words> options;
    std::istringstream lines(page);
    std::string heading;
    for (std::string line; std::getline(lines, line);) {
        if (line.compare(0, 3, ".SS") == 0 || line.compare(0, 3, ".SH") == 0) {
            heading = line.substr(4);
        } else if (line == ".TP" && std::getline(lines, line)) {
            options[heading].merge(optionsIn(line));
        }
    }
    return options;
}

bool names(const std::string& heading, const std::string& command) {
    return std::regex_search(heading, std::regex("\\b" + command + "\\b"));
}

/// The commands that vantel-host has.
Words commands() {
    static const std::regex command("\n  ([a-z]+) {3,}");
    const std::string help = outputOf(VANTEL_HOST " --help");
    const std::string list = help.substr(help.find("Subcommands:"));
    Words names;
    for (std::sregex_iterator found(list.begin(), list.end(), command), end; found != end;
         ++found) {
        names.insert((*found)[1]);
    }
    return names;
}

TEST(ManualPagesTest, HostsOptionsAreThoseOfEachCommand) {
    const auto listed = listedOptions(page("vantel-host.1"));
    EXPECT_GE(commands().size(), 4U);
    for (const std::string& command : commands()) {
        Words documented;
        for (const auto& [heading, options] : listed) {
            if (names(heading, command)) {
                documented.insert(options.begin(), options.end());
            }
        }
        EXPECT_EQ(documented, helpOptions(outputOf(VANTEL_HOST " " + command + " --help")))
            << command;
    }
}

TEST(ManualPagesTest, HostsCommandsAreAllInItsSynopsis) {
    static const std::regex line("\n\\.B vantel-host ([a-z]+)");
    const std::string text = page("vantel-host.1");
    Words shown;
    for (std::sregex_iterator found(text.begin(), text.end(), line), end; found != end; ++found) {
        shown.insert((*found)[1]);
    }
    EXPECT_EQ(shown, commands());
    EXPECT_NE(text.find("\n.B vantel-host --version\n"), std::string::npos);
}

TEST(ManualPagesTest, SimulatorsOptionsAreThoseOfItsHelp) {
    const auto listed = listedOptions(page("simptp4l.1"));
    EXPECT_EQ(listed.at("OPTIONS"), helpOptions(outputOf(VANTEL_SIMPTP4L " --help")));
}

TEST(ManualPagesTest, TheyAreOfThisVersion) {
    static const std::regex version("\n  VERSION ([0-9.]+)\n");
    const std::string build = projectFile("CMakeLists.txt");
    std::smatch found;
    ASSERT_TRUE(std::regex_search(build, found, version));
    for (const char* name : {"vantel-host.1", "vantel-host.toml.5", "simptp4l.1"}) {
        EXPECT_NE(page(name).find("\"vantel_bc " + found[1].str() + "\""), std::string::npos)
            << name;
    }
}

TEST(ManualPagesTest, TheFileOfTheExampleIsGood) {
    static const std::regex example(R"(\n\.nf\n([^]*?)\.fi\n)");
    const std::string text = page("vantel-host.toml.5");
    std::smatch found;
    ASSERT_TRUE(std::regex_search(text, found, example));
    const std::string checked =
        outputOf("printf '%s' '" + found[1].str() +
                 "' | " VANTEL_HOST " check --config - --library " VANTEL_BC_LIBRARY " 2>&1");
    EXPECT_NE(checked.find("ok    settings "), std::string::npos) << checked;
    EXPECT_NE(checked.find("2, each named once"), std::string::npos) << checked;
}

/// A program that complains about pages.
class ManualPagesLintTest : public testing::TestWithParam<const char*> {
protected:
    static void expectNoComplaint(const std::string& program, const std::string& arguments) {
        if (outputOf("command -v " + program).empty()) {
            GTEST_SKIP() << program << " is not installed; run scripts/setup.sh";
        }
        const std::string file = std::string(VANTEL_PROJECT_FOLDER "/docs/man/") + GetParam();
        EXPECT_EQ(outputOf(program + " " + arguments + " '" + file + "' 2>&1"), "");
    }
};

TEST_P(ManualPagesLintTest, MandocFindsNothing) {
    expectNoComplaint("mandoc", "-T lint -W warning");
}

TEST_P(ManualPagesLintTest, GroffFindsNothing) {
    expectNoComplaint("groff", "-ww -z -man -Tutf8");
}

std::string nameOfPage(const testing::TestParamInfo<const char*>& page) {
    return std::vector<std::string>{"host", "simulator", "file"}.at(page.index);
}

INSTANTIATE_TEST_SUITE_P(Pages, ManualPagesLintTest,
                         testing::Values("vantel-host.1", "simptp4l.1", "vantel-host.toml.5"),
                         nameOfPage);

} // namespace
