// The static probe points of the shipped library, which docs/tracing.md lists.

#include <cstdlib>
#include <regex>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "NamedTests.h"
#include "support/CommandOutput.h"
#include "support/TemporaryFolder.h"

namespace {

using Texts = std::multiset<std::string>;

/// Each probe point of a library: its name, and the octets of its arguments, negative for signed.
Texts probePoints(const std::string& library) {
    static const std::regex note("Provider: vantel_bc\\s+Name: (\\w+)\\s+Location: [^\n]*\\s+"
                                 "Arguments: ([^\n]*)");
    static const std::regex argument("(-?[0-9]+)@");
    const std::string notes = outputOf("LC_ALL=C readelf -n '" + library + "'");
    Texts points;
    for (std::sregex_iterator found(notes.begin(), notes.end(), note), end; found != end; ++found) {
        std::string point = (*found)[1];
        const std::string arguments = (*found)[2];
        for (std::sregex_iterator size(arguments.begin(), arguments.end(), argument); size != end;
             ++size) {
            point += " " + (*size)[1].str();
        }
        points.insert(point);
    }
    return points;
}

class ProbePointsTest : public testing::Test {
protected:
    void SetUp() override {
        if (!VANTEL_STATIC_PROBES) {
            GTEST_SKIP() << "built without <sys/sdt.h>";
        }
    }

    const std::string word = std::to_string(sizeof(void*));
    const Texts expected{"exchange__start 2 2", "exchange__end 2 2 -4", "sleep__chosen 4",
                         "offsets__drained " + word + " -8", "host__call " + word + " -4"};
};

TEST_F(ProbePointsTest, AreThoseOfTheFiveEvents) {
    EXPECT_EQ(probePoints(VANTEL_BC_LIBRARY), expected);
}

TEST_F(ProbePointsTest, SurviveStripping) {
    const TemporaryFolder folder;
    ASSERT_EQ(std::system(VANTEL_STRIP " -o stripped.so '" VANTEL_BC_LIBRARY "'"), 0);
    EXPECT_EQ(probePoints("stripped.so"), expected);
}

TEST(ProbePointsDocumentTest, HasARowForEachEvent) {
    static const std::regex row("\n\\| `([a-z_]+)` \\|");
    const std::string document = projectFile("docs/tracing.md");
    Texts rows;
    for (std::sregex_iterator found(document.begin(), document.end(), row), end; found != end;
         ++found) {
        rows.insert((*found)[1]);
    }
    EXPECT_EQ(rows, (Texts{"exchange__start", "exchange__end", "sleep__chosen", "offsets__drained",
                           "host__call"}));
}

} // namespace
