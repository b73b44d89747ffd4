#include <gmock/gmock.h>

#include "Interposed.h"
#include "SessionFixture.h"

namespace {

using testing::SizeIs;

/// The parameter is how many threads there can still be.
class ThreadFailureTest : public SessionTest, public testing::WithParamInterface<int> {
protected:
    void startWithoutThreads(HostStatus& status) {
        const ThreadLimit limit(GetParam());
        EXPECT_NO_THROW(session.start(status));
    }
};

TEST_P(ThreadFailureTest, IsReportedAndLeavesNothingRunning) {
    SimulatedDaemon::script("gm present\n");
    session.initialise();
    HostStatus status;
    startWithoutThreads(status);
    EXPECT_EQ(status.code, -52003);
    EXPECT_EQ(status.text(), R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
                             R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
                             R"("std_exception_what":"Resource temporarily unavailable"})");
    EXPECT_FALSE(hasChildren());
    expectOwnThreads(0);
    EXPECT_THAT(sentSignals(), SizeIs(1));
}

TEST_P(ThreadFailureTest, LaterStartWorks) {
    SimulatedDaemon::script("gm present\n");
    session.initialise();
    HostStatus status;
    startWithoutThreads(status);
    ASSERT_EQ(status.code, -52003);
    session.start();
    EXPECT_TRUE(waitForCalls(Function::getTime, 2));
    expectOwnThreads(2);
    session.stop();
    EXPECT_FALSE(hasChildren());
    expectOwnThreads(0);
}

TEST_P(ThreadFailureTest, StopAndFinaliseAfterItDoNothing) {
    SimulatedDaemon::script("gm present\n");
    session.initialise();
    HostStatus status;
    startWithoutThreads(status);
    ASSERT_EQ(status.code, -52003);
    session.stop();
    session.finalise();
    EXPECT_THAT(sentSignals(), SizeIs(1));
}

INSTANTIATE_TEST_SUITE_P(Threads, ThreadFailureTest, testing::Values(0, 1),
                         [](const auto& testInfo) {
                             return testInfo.param == 0 ? "OfTheWorker" : "OfTheWatchdog";
                         });

} // namespace
