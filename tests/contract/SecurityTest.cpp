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

/// The number of each duty that a cell names; empty where it names one without its number.
std::vector<std::string> duties(const std::string& cell) {
    static const std::regex duty("dut(?:ies|y ?([0-9]*))");
    return {std::sregex_token_iterator(cell.begin(), cell.end(), duty, 1),
            std::sregex_token_iterator()};
}

TEST(SecurityTest, EveryRowNamesATestOrADuty) {
    EXPECT_FALSE(evidence().empty());
    for (const std::string& cell : evidence()) {
        EXPECT_TRUE(!quotedTests(cell).empty() || !duties(cell).empty()) << cell;
    }
}

TEST(SecurityTest, EveryDutyThatIsNamedIsInTheList) {
    const std::string document = projectFile("docs/security.md");
    for (const std::string& cell : evidence()) {
        for (const std::string& number : duties(cell)) {
            EXPECT_NE(document.find("\n" + number + ". "), std::string::npos) << cell;
        }
    }
}

TEST(SecurityTest, EveryTestThatIsNamedExists) {
    const auto defined = definedTests();
    for (const std::string& name : quotedTests(projectFile("docs/security.md"))) {
        EXPECT_EQ(defined.count(name), 1U) << name;
    }
}

} // namespace
