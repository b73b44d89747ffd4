// Keeps the table of ptp4l's versions in docs/configuration.md in step with the one that is
// installed.

#include <algorithm>
#include <regex>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "NamedTests.h"
#include "support/CommandOutput.h"
#include "support/Markdown.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr char ptp4l[] = "/usr/sbin/ptp4l";

/// What stands between commas.
std::vector<std::string> listed(const std::string& text) {
    std::istringstream words(text);
    std::vector<std::string> all;
    for (std::string each; std::getline(words >> std::ws, each, ',');) {
        all.push_back(each);
    }
    return all;
}

/// The row that names a version; empty when there is none.
markdown::Row rowOf(const std::string& version) {
    for (const auto& row :
         markdown::tables(projectFile("docs/configuration.md"),
                          {"linuxptp", "first poll", "`uds_ro_address`",
                           "\"followUpInfo\" true with \"transportSpecific\" \"0x0\""})) {
        const auto versions = listed(row.at(0));
        if (std::find(versions.begin(), versions.end(), version) != versions.end()) {
            return row;
        }
    }
    return {};
}

TEST(Ptp4lVersionsTest, InstalledOneKnowsTheReadOnlySocketAsItsRowSays) {
    std::string version;
    std::istringstream(outputOf(std::string(ptp4l) + " -v 2>/dev/null")) >> version;
    if (version.empty()) {
        GTEST_SKIP() << "there is no " << ptp4l << " (package linuxptp)";
    }
    const markdown::Row row = rowOf(version);
    if (row.empty()) {
        GTEST_SKIP() << "the table does not know ptp4l " << version;
    }
    const TemporaryFolder folder;
    writeFile("ptp4l.conf", "[global]\nuds_ro_address ptp4l.ro\n");
    // Without an interface it ends once it has taken the file.
    const std::string judgement = outputOf(std::string(ptp4l) + " -f ptp4l.conf 2>&1");
    const bool isKnown = judgement.find("no interface specified") != std::string::npos;
    EXPECT_EQ(row.at(2), isKnown ? "shared" : "unknown") << judgement;
}

TEST(Ptp4lVersionsTest, EveryVersionThatWasRunHasARow) {
    static const std::regex run("run with ptp4l of linuxptp ([^a-z]+) and its newest");
    const std::string document = projectFile("docs/configuration.md");
    std::smatch found;
    ASSERT_TRUE(std::regex_search(document, found, run));
    const auto versions = listed(found[1]);
    EXPECT_EQ(versions.size(), 15U);
    for (const std::string& version : versions) {
        EXPECT_FALSE(rowOf(version).empty()) << version;
    }
}

} // namespace
