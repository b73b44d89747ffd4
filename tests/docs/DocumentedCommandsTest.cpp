// Every command that the documents show stands in commands.txt, which says how it is verified.

#include <filesystem>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "Roff.h"
#include "contract/NamedTests.h"
#include "support/Markdown.h"
#include "support/TemporaryFolder.h"

namespace {

namespace fs = std::filesystem;

struct Entry {
    std::string how, command, detail;
};

std::vector<Entry> entries() {
    static const std::regex line(R"((\w+)( \d+| \^C)? \| (.+) \|(?: (.+))?)");
    std::istringstream lines(projectFile("tests/docs/commands.txt"));
    std::vector<Entry> all;
    std::smatch match;
    for (std::string text; std::getline(lines, text);) {
        if (std::regex_match(text, match, line)) {
            all.push_back({match[1], match[3], match[4]});
        } else {
            EXPECT_TRUE(text.empty() || text[0] == '#') << "not understood: " << text;
        }
    }
    return all;
}

std::string oneBlankEach(const std::string& text) {
    std::istringstream words(text);
    std::string result;
    for (std::string word; words >> word;) {
        result += (result.empty() ? "" : " ") + word;
    }
    return result;
}

/// A command goes on in the next line behind a backslash and inside of quotes.
bool isComplete(std::string& command) {
    if (!command.empty() && command.back() == '\\') {
        command.back() = ' ';
        return false;
    }
    bool quoted = false;
    for (std::size_t at = 0; at < command.size(); ++at) {
        if (command[at] == '"' && (at == 0 || command[at - 1] != '\\')) {
            quoted = !quoted;
        }
    }
    return !quoted;
}

/// The commands of a block, without comments.
std::vector<std::string> commandsIn(const std::string& block) {
    static const std::regex comment("(^|[ ]{2,})#[^\n]*");
    std::istringstream lines(std::regex_replace(block, comment, ""));
    std::vector<std::string> commands;
    std::string command;
    for (std::string line; std::getline(lines, line);) {
        command += line;
        if (isComplete(command)) {
            if (!oneBlankEach(command).empty()) {
                commands.push_back(oneBlankEach(command));
            }
            command.clear();
        } else {
            command += ' ';
        }
    }
    EXPECT_TRUE(command.empty()) << command;
    return commands;
}

std::vector<std::string> documents() {
    const fs::path root = VANTEL_PROJECT_FOLDER;
    std::vector<std::string> names = {"README.md", "CONTRIBUTING.md"};
    for (const char* folder : {"docs", "tools"}) {
        for (const auto& entry : fs::recursive_directory_iterator(root / folder)) {
            if (entry.path().extension() == ".md") {
                names.push_back(entry.path().lexically_relative(root));
            }
        }
    }
    return names;
}

/// The examples of all manual pages.
std::vector<std::string> manualExamples() {
    static const std::regex example(R"(\n\.EX\n([^]*?)\n\.EE)");
    std::vector<std::string> examples;
    for (const auto& entry : fs::directory_iterator(fs::path(VANTEL_PROJECT_FOLDER) / "docs/man")) {
        const std::string page = unescapedRoff(readFile(entry.path()));
        for (std::sregex_iterator found(page.begin(), page.end(), example), end; found != end;
             ++found) {
            examples.push_back((*found)[1]);
        }
    }
    return examples;
}

/// Blocks without a language are commands.
std::set<std::string> shownCommands() {
    static const std::set<std::string> others = {"c", "hex", "json", "text", "yaml"};
    std::set<std::string> shown;
    for (const std::string& example : manualExamples()) {
        for (const std::string& command : commandsIn(example)) {
            shown.insert(command);
        }
    }
    for (const std::string& name : documents()) {
        for (const auto& block : markdown::blocks(projectFile(name))) {
            if (block.language.empty()) {
                for (const std::string& command : commandsIn(block.text)) {
                    shown.insert(command);
                }
            } else {
                EXPECT_EQ(others.count(block.language), 1U)
                    << name << ": a block of " << block.language;
            }
        }
    }
    return shown;
}

TEST(DocumentedCommandsTest, EachStandsInTheTableOfHowItIsVerified) {
    std::set<std::string> verified;
    for (const Entry& entry : entries()) {
        EXPECT_TRUE(verified.insert(entry.command).second) << entry.command << " stands twice";
    }
    const auto shown = shownCommands();
    EXPECT_GE(shown.size(), 20U);
    for (const std::string& command : shown) {
        if (verified.count(command) == 0) {
            ADD_FAILURE() << "not in tests/docs/commands.txt: " << command
                          << "\nIf it is no command but output, begin its block with ```text.";
        }
    }
    for (const std::string& command : verified) {
        if (shown.count(command) == 0) {
            ADD_FAILURE() << "shown nowhere: " << command;
        }
    }
}

bool exists(const std::string& test) {
    static const auto tests = definedTests();
    static const std::string others =
        projectFile("tests/packaging/CMakeLists.txt") + projectFile("tests/soak/CMakeLists.txt") +
        projectFile("bench/CMakeLists.txt") + projectFile("fuzz/CMakeLists.txt");
    return tests.count(test) == 1 || fs::exists(fs::path(VANTEL_PROJECT_FOLDER) / test) ||
           others.find(test.substr(test.rfind('.') + 1)) != std::string::npos;
}

TEST(DocumentedCommandsTest, WhatVerifiesThemExists) {
    static const std::set<std::string> others = {"none", "run", "scene"};
    const std::string steps = projectFile(".ci/run");
    for (const Entry& entry : entries()) {
        if (entry.how == "ci") {
            EXPECT_NE(steps.find("step " + entry.detail + ' '), std::string::npos) << entry.detail;
        } else if (entry.how == "test") {
            EXPECT_TRUE(exists(entry.detail.substr(0, entry.detail.find(": ")))) << entry.detail;
        } else {
            EXPECT_EQ(others.count(entry.how), 1U) << entry.how;
        }
    }
}

} // namespace
