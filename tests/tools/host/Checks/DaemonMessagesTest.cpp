// Each message of ptp4l that is understood, as a file provokes it.

#include "Checks/DaemonMessages.h"

#include <sstream>

#include <unistd.h>

#include "Checks/TimedProgram.h"
#include "Tool.h"

using namespace vantelhost;

namespace {

constexpr char realDaemon[] = "/usr/sbin/ptp4l";

struct Sample {
    const char* name;
    const char* file;
    const char* message;
    const char* option;
};

/// In the order of daemonMessages.
constexpr std::array<Sample, 6> samples = {{
    {"BadValue", "[global]\ndelay_mechanism NONSENSE\n",
     "NONSENSE is a bad value for option delay_mechanism at line 2", "delay_mechanism"},
    {"MalformedValue", "[global]\npriority1 1.5\n",
     "1.5 is a malformed value for option priority1 at line 2", "priority1"},
    {"OutOfRange", "[global]\npriority1 300\n",
     "300 is an out of range value for option priority1 at line 2", "priority1"},
    {"UnknownOption", "[global]\nfrobnicate 1\n",
     "unknown option frobnicate at line 2 in global section", "frobnicate"},
    {"NoValue", "[global]\npriority1 1\nuds_address \npriority2 2\n",
     "could not parse line 3 in global section", "uds_address"},
    {"Taken", "[global]\npriority1 1\n", "no interface specified", ""},
}};
static_assert(samples.size() == std::tuple_size_v<decltype(daemonMessages)>);

class DaemonMessagesTest : public testing::TestWithParam<std::size_t> {
protected:
    const Sample& sample = samples[GetParam()];
    const DaemonMessage& message = daemonMessages[GetParam()];

    bool wasSeenIn(const std::string& version) const {
        std::istringstream versions(message.versions);
        for (std::string each; versions >> each;) {
            if (each == version) {
                return true;
            }
        }
        return false;
    }
};

std::string firstLine(const std::string& text) {
    return text.substr(0, text.find('\n'));
}

std::string said(const Words& words) {
    return firstLine(runTimed(words, std::chrono::seconds(20)).output);
}

} // namespace

TEST_P(DaemonMessagesTest, IsUnderstood) {
    const Answer answer = understand(std::string(sample.message) + "\nand more\n", sample.file);
    EXPECT_EQ(answer.isTaken, message.names == DaemonMessage::Names::nothing);
    EXPECT_EQ(answer.option, sample.option);
}

TEST_P(DaemonMessagesTest, IsWhatTheInstalledDaemonSays) {
    if (::access(realDaemon, X_OK) != 0) {
        GTEST_SKIP() << "SKIPPED: there is no " << realDaemon << " (package linuxptp)";
    }
    const std::string version = said({realDaemon, "-v"});
    if (!wasSeenIn(version)) {
        GTEST_SKIP() << "SKIPPED: linuxptp " << version << " is none of " << message.versions;
    }
    const Folder folder;
    writeFile(folder.path("conf"), sample.file);
    EXPECT_EQ(said({realDaemon, "-f", folder.path("conf"), "-m", "-q"}), sample.message);
}

INSTANTIATE_TEST_SUITE_P(Each, DaemonMessagesTest, testing::Range(std::size_t{0}, samples.size()),
                         [](const auto& each) { return samples[each.param].name; });

TEST(DaemonMessages, OfAnotherKindAreNotUnderstood) {
    for (const char* text : {"", "ptp4l: not found\n", "unknown option x\n",
                             "could not parse line\n", "no interface\n"}) {
        const Answer answer = understand(text, "[global]\n");
        EXPECT_FALSE(answer.isTaken) << text;
        EXPECT_EQ(answer.option, "") << text;
    }
}

TEST(DaemonMessages, ARefusedValueCanBeAnyText) {
    const Answer answer = understand(
        "no interface specified is a bad value for option network_transport at line 82\n", "");
    EXPECT_FALSE(answer.isTaken);
    EXPECT_EQ(answer.option, "network_transport");
}

TEST(DaemonMessages, ALineThatTheFileDoesNotHaveNamesNoOption) {
    for (const char* number : {"0", "3", "-1", "9223372036854775807", "x"}) {
        const std::string text = "could not parse line " + std::string(number) + " in a section";
        EXPECT_EQ(understand(text, "[global]\npriority1\n").option, "") << number;
    }
}

TEST(DaemonMessages, OtherLinesAroundThemDoNotMatter) {
    EXPECT_TRUE(
        understand("a word of a script\nno interface specified\n\nusage: ...\n", "").isTaken);
}
