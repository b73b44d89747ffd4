// Keeps docs/security.md in step with the tests that hold it.

#include <regex>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "NamedTests.h"

namespace {

/// The last cells of the table "| who | reaches | can | the plug-in | held by |".
std::vector<std::string> evidence() {
    static const std::regex row(R"(\|( [^|]+ \|){4} ([^|]+) \|)");
    std::istringstream lines(projectFile("docs/security.md"));
    std::vector<std::string> cells;
    std::smatch match;
    for (std::string line; std::getline(lines, line);) {
        if (!std::regex_match(line, match, row)) {
            EXPECT_NE(line.compare(0, 2, "| "), 0) << "not understood: " << line;
        } else if (match[2] != "held by") {
            cells.push_back(match[2]);
        }
    }
    return cells;
}

bool namesADuty(const std::string& cell) {
    static const std::regex duty("deployment duty ([0-9]+)");
    const std::string text = projectFile("docs/security.md");
    std::smatch match;
    return std::regex_search(cell, match, duty) &&
           text.find("\n" + match[1].str() + ". ") != std::string::npos;
}

TEST(SecurityTest, EveryRowNamesATestOrADuty) {
    EXPECT_FALSE(evidence().empty());
    for (const std::string& cell : evidence()) {
        EXPECT_TRUE(!quotedTests(cell).empty() || namesADuty(cell)) << cell;
        EXPECT_EQ(cell.find("duty") != std::string::npos, namesADuty(cell)) << cell;
    }
}

TEST(SecurityTest, EveryTestThatIsNamedExists) {
    const auto defined = definedTests();
    for (const std::string& name : quotedTests(projectFile("docs/security.md"))) {
        EXPECT_EQ(defined.count(name), 1U) << name;
    }
}

} // namespace
