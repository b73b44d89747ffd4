// Keeps docs/oddities.md, the comments that it explains, and the tests that hold them in step.

#include <map>
#include <regex>
#include <set>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include "NamedTests.h"

namespace {

/// The names in the comments "[oddity NAME]".
std::multiset<std::string> taggedNames() {
    static const std::string tag = "[oddity ";
    const std::string text =
        sourcesBelow("source") + sourcesBelow("support") + sourcesBelow("include");
    std::multiset<std::string> names;
    for (std::size_t at = text.find(tag); at != std::string::npos; at = text.find(tag, at + 1)) {
        const std::size_t name = at + tag.size();
        names.insert(text.substr(name, text.find(']', name) - name));
    }
    return names;
}

/// The tests by the names of the rows "| NAME | what | why | `Suite.Test` |".
std::map<std::string, std::string> registeredTests() {
    static const std::regex row(
        R"(\| ([a-z0-9-]+) \| [^|]+ \| [^|]+ \| `([A-Za-z0-9_]+\.[A-Za-z0-9_]+)` \|)");
    std::istringstream lines(projectFile("docs/oddities.md"));
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
    const auto tags = taggedNames();
    for (const std::string& name : tags) {
        EXPECT_EQ(tags.count(name), 1U) << name;
        EXPECT_EQ(rows.count(name), 1U) << name;
    }
}

TEST(Oddities, EveryRowHasATagAndATest) {
    const auto tags = taggedNames();
    const auto tests = definedTests();
    const auto rows = registeredTests();
    EXPECT_FALSE(rows.empty());
    for (const auto& [name, test] : rows) {
        EXPECT_EQ(tags.count(name), 1U) << name;
        EXPECT_EQ(tests.count(test), 1U) << test;
    }
}

} // namespace
