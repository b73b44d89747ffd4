// Keeps docs/oddities.md, the comments that it explains, and the tests that hold them in step.

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <set>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include "support/TemporaryFolder.h"

namespace {

const std::filesystem::path root = VANTEL_PROJECT_FOLDER;

std::string textBelow(const std::string& folder) {
    std::string text;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(root / folder)) {
        if (const auto kind = entry.path().extension(); kind == ".h" || kind == ".cpp") {
            text += readFile(entry.path());
        }
    }
    return text;
}

/// The names in the comments "[oddity NAME]".
std::multiset<std::string> taggedNames() {
    static const std::regex tag(R"(\[oddity ([a-z0-9-]+)\])");
    const std::string text = textBelow("source") + textBelow("support") + textBelow("include");
    std::multiset<std::string> names;
    for (std::sregex_iterator found(text.begin(), text.end(), tag), end; found != end; ++found) {
        names.insert((*found)[1]);
    }
    return names;
}

/// The tests by the names of the rows "| NAME | what | why | `Suite.Test` |".
std::map<std::string, std::string> registeredTests() {
    static const std::regex row(
        R"(\| ([a-z0-9-]+) \| [^|]+ \| [^|]+ \| `([A-Za-z0-9_]+\.[A-Za-z0-9_]+)` \|)");
    std::istringstream lines(readFile(root / "docs/oddities.md"));
    std::map<std::string, std::string> rows;
    std::smatch match;
    for (std::string line; std::getline(lines, line);) {
        if (std::regex_match(line, match, row)) {
            EXPECT_TRUE(rows.emplace(match[1], match[2]).second) << match[1] << " stands twice";
        } else {
            EXPECT_TRUE(line.rfind("| ", 0) != 0 || line.rfind("| name ", 0) == 0)
                << "not understood: " << line;
        }
    }
    return rows;
}

TEST(Oddities, EveryTagStandsOnceAndHasARow) {
    const auto rows = registeredTests();
    for (const std::string& name : taggedNames()) {
        EXPECT_EQ(taggedNames().count(name), 1U) << name;
        EXPECT_EQ(rows.count(name), 1U) << name;
    }
}

TEST(Oddities, EveryRowHasATagAndATest) {
    const auto tags = taggedNames();
    const std::string tests = textBelow("tests");
    const auto rows = registeredTests();
    EXPECT_FALSE(rows.empty());
    for (const auto& [name, test] : rows) {
        EXPECT_EQ(tags.count(name), 1U) << name;
        const std::string suite = test.substr(0, test.find('.'));
        const std::string behaviour = test.substr(test.find('.') + 1);
        const std::regex declaration(R"(TEST(_F|_P)?\(\s*)" + suite + R"(,\s*)" + behaviour +
                                     R"(\s*\))");
        EXPECT_TRUE(std::regex_search(tests, declaration)) << test;
    }
}

} // namespace
