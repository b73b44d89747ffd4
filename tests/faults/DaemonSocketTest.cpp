// The daemon's socket file is gone, is something else, or never was there.

#include <filesystem>

#include <gmock/gmock.h>

#include "FaultTest.h"
#include "Interposed.h"

namespace {

using testing::Contains;
using testing::IsEmpty;

constexpr char path[] = "ptp4l.sock";

class DaemonSocketTest : public FaultTest {
protected:
    /// Begins with a daemon of another address.
    void beginAt(const std::string& address, const std::string& script) {
        SimulatedDaemon::script(script);
        std::string configuration = sessionConfiguration();
        configuration.replace(configuration.find(path), std::string(path).size(), address);
        session.initialise(configuration);
        session.start();
    }

    /// Expects a failure of each poll.
    void expectFailures(int code) {
        expectFailure(code);
        const std::size_t polls = host.calls(Function::getTime).size();
        ASSERT_TRUE(waitForLog(failureLine(code), log.count(failureLine(code)) + 1));
        EXPECT_EQ(host.calls(Function::getTime).size(), polls);
        EXPECT_THAT(newQualities(), testing::Each(unreachable));
        EXPECT_THAT(newMetaData(), testing::Each(defaultMetaData));
    }
};

TEST_F(DaemonSocketTest, RemovedIsAFailureOfEachPoll) {
    beginWell();
    std::filesystem::remove(path);
    expectFailures(-52024);
    expectStopWithin({});
}

TEST_F(DaemonSocketTest, ReplacedByAFileIsAFailureOfEachPoll) {
    beginWell();
    std::filesystem::remove(path);
    writeFile(path, "no socket");
    expectFailures(-52024);
    expectStopWithin({});
}

TEST_F(DaemonSocketTest, ReplacedByOneThatNobodyReadsIsSilence) {
    beginWell();
    std::filesystem::remove(path);
    const DatagramSocket other(path);
    expectFailure(-52007);
    ASSERT_TRUE(waitUntilAnswerIsAwaited());
    expectStopWithin({1});
}

// As it is by ptp4l, in whose place the test answers: both meet.
TEST_F(DaemonSocketTest, AboveALengthOf107IsCut) {
    answers = std::make_unique<FakePtp4l>(std::string(107, 's'),
                                          std::vector<FakePtp4l::Measurement>{{5, 1000, 1}});
    helpers.threads = 1;
    beginAt(std::string(200, 's'), "start-delay 1000000\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 2));
    EXPECT_THAT(qualities(), testing::ElementsAre(waiting, usable));
    EXPECT_EQ(host.calls(Function::adjustTime).at(0).localTime, 1000U);
    expectStopWithin({});
}

TEST_F(DaemonSocketTest, InAMissingFolderEndsTheDaemon) {
    beginAt("missing/ptp4l.sock", "gm present\n");
    ASSERT_TRUE(waitForLog(failureLine(-52024), 2)); // The first is reported by then.
    expectOwnThreads(1);                             // The watchdog has reported.
    EXPECT_THAT(qualities(), Contains(died));
    EXPECT_THAT(qualities(), Contains(unreachable));
    EXPECT_EQ(metaData().back(), defaultMetaData);
    expectStopWithin({});
    EXPECT_THAT(sentSignals(), IsEmpty());
}

} // namespace
