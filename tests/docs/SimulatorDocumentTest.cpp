// Keeps the description of simptp4l's scripts, and the examples, in step with what it understands.

#include <filesystem>
#include <regex>
#include <set>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include "contract/NamedTests.h"
#include "support/Markdown.h"
#include "support/TemporaryFolder.h"

namespace {

using Words = std::set<std::string>;

/// The words of a table "{"word", ...," in a source of the simulator.
Words understood(const std::string& source, const std::string& second) {
    const std::regex entry("\\{\"([a-z-]+)\", " + second);
    const std::string text = projectFile("tools/simptp4l/" + source);
    Words words;
    for (std::sregex_iterator found(text.begin(), text.end(), entry), end; found != end; ++found) {
        words.insert((*found)[1]);
    }
    return words;
}

Words lineWords() {
    return understood("ScriptParser.cpp", "take");
}

Words actionWords() {
    return understood("ScriptActions.cpp", "ActionKind");
}

/// The first word of what a cell quotes.
std::string firstWord(const std::string& cell) {
    return cell.substr(1, cell.find_first_of(" `", 1) - 1);
}

Words documented(const markdown::Row& heading) {
    Words words;
    for (const auto& row : markdown::tables(projectFile("tools/simptp4l/README.md"), heading)) {
        words.insert(firstWord(row.at(0)));
    }
    return words;
}

/// What the examples use: first words of lines, and words behind "do".
Words usedByExamples() {
    static const std::regex action("\\bdo ([a-z-]+)");
    Words words;
    const std::string folder = VANTEL_PROJECT_FOLDER "/tools/simptp4l/examples";
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
        std::istringstream lines(readFile(entry.path()));
        std::smatch found;
        for (std::string line; std::getline(lines, line);) {
            words.insert(line.substr(0, line.find(' ')));
            if (std::regex_search(line, found, action)) {
                words.insert(found[1]);
            }
        }
    }
    return words;
}

TEST(SimulatorDocumentTest, EveryLineIsDescribed) {
    EXPECT_GE(lineWords().size(), 20U);
    EXPECT_EQ(documented({"line", "meaning", "default"}), lineWords());
}

TEST(SimulatorDocumentTest, EveryActionIsDescribed) {
    EXPECT_GE(actionWords().size(), 18U);
    EXPECT_EQ(documented({"action", "effect"}), actionWords());
}

TEST(SimulatorDocumentTest, EveryLineAndEveryActionHasAnExample) {
    Words all = lineWords();
    all.merge(actionWords());
    const Words used = usedByExamples();
    for (const std::string& word : all) {
        EXPECT_EQ(used.count(word), 1U) << word;
    }
}

} // namespace
