// Keeps the tables of docs/testing.md and tests/faults in step.

#include <regex>
#include <set>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include "NamedTests.h"

namespace {

/// The section "## Faults", without its heading.
std::string faultsSection() {
    const std::string text = projectFile("docs/testing.md");
    const std::string heading = "\n## Faults\n";
    const std::size_t begin = text.find(heading);
    EXPECT_NE(begin, std::string::npos);
    return text.substr(begin + heading.size(),
                       text.find("\n## ", begin + 1) - begin - heading.size());
}

/// The tests of the rows "| fault | the host sees | stop takes at most | `Suite.Behaviour` |".
std::multiset<std::string> tabulatedTests() {
    static const std::regex row(R"(\| [^|]+ \| [^|]+ \| [0-9.]+ s \| `(\w+\.\w+)` \|)");
    std::istringstream lines(faultsSection());
    std::multiset<std::string> names;
    std::smatch match;
    for (std::string line; std::getline(lines, line);) {
        if (std::regex_match(line, match, row)) {
            names.insert(match[1]);
        } else {
            EXPECT_TRUE(line.rfind("| ", 0) != 0 || line.rfind("| fault |", 0) == 0)
                << "not understood: " << line;
        }
    }
    return names;
}

TEST(FaultMatrix, EveryFaultTestHasOneRow) {
    const auto rows = tabulatedTests();
    const auto tests = definedTests("tests/faults");
    EXPECT_FALSE(tests.empty());
    for (const std::string& name : tests) {
        EXPECT_EQ(rows.count(name), 1U) << name;
    }
}

TEST(FaultMatrix, EveryRowHasAFaultTest) {
    const auto tests = definedTests("tests/faults");
    for (const std::string& name : tabulatedTests()) {
        EXPECT_EQ(tests.count(name), 1U) << name;
    }
}

} // namespace
