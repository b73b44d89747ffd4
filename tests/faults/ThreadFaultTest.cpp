// A host that can have no more threads.

#include <gmock/gmock.h>

#include "FaultTest.h"
#include "Interposed.h"

namespace {

using testing::SizeIs;

/// The parameter is how many threads there can still be.
class ThreadFaultTest : public FaultTest, public testing::WithParamInterface<int> {
protected:
    void startWithoutThreads() {
        SimulatedDaemon::script("gm present\n");
        session.initialise();
        const ThreadLimit limit(GetParam());
        HostStatus status;
        EXPECT_NO_THROW(session.start(status));
        EXPECT_EQ(status.code, -52003);
        EXPECT_EQ(status.text(),
                  R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
                  R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
                  R"("std_exception_what":"Resource temporarily unavailable"})");
    }
};

TEST_P(ThreadFaultTest, IsReportedAndLeavesNothingRunning) {
    startWithoutThreads();
    EXPECT_FALSE(hasChildren());
    expectOwnThreads(0);
    EXPECT_THAT(sentSignals(), SizeIs(1));
    expectStopWithin({0, false});
    EXPECT_THAT(sentSignals(), SizeIs(1));
}

TEST_P(ThreadFaultTest, LaterStartWorks) {
    startWithoutThreads();
    session.start();
    EXPECT_TRUE(waitForCalls(Function::getTime, 2));
    expectOwnThreads(2);
    expectStopWithin({});
}

INSTANTIATE_TEST_SUITE_P(Threads, ThreadFaultTest, testing::Values(0, 1), [](const auto& testInfo) {
    return testInfo.param == 0 ? "OfTheWorker" : "OfTheWatchdog";
});

} // namespace
