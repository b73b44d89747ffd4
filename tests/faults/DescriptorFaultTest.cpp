// A host that has no descriptor left, or none that select(2) can take.

#include <cerrno>
#include <memory>
#include <optional>

#include <gmock/gmock.h>
#include <sys/select.h>
#include <syslog.h>

#include "FaultTest.h"
#include "InterposedWaits.h"
#include "RefusedCalls.h"
#include "support/Descriptors.h"

namespace {

using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

class DescriptorFaultTest : public FaultTest {
protected:
    /// Expects that polls fail with a code, and nothing else is told, from the first one on.
    void expectUnreachable(int code) {
        ASSERT_TRUE(waitForLog(failureLine(code), 3));
        ASSERT_TRUE(waitForCalls(Function::updateMetaData, 4));
        auto reports = qualities();
        reports.resize(4);
        EXPECT_THAT(reports, ElementsAre(waiting, unreachable, unreachable, unreachable));
        EXPECT_THAT(metaData(), Each(defaultMetaData));
        EXPECT_THAT(log.lines(), Contains(SyslogCapture::Line{LOG_INFO, failureLine(code)}));
        EXPECT_THAT(host.calls(Function::getTime), IsEmpty());
    }

    /// Begins, with no descriptor from the first good poll on, when the socket is open. Expects
    /// that there is no pair.
    std::shared_ptr<std::optional<RefusedCalls>> beginWithoutFifo() {
        auto refused = std::make_shared<std::optional<RefusedCalls>>();
        onEachPoll([=](int poll) {
            if (poll == 0) {
                refused->emplace(EMFILE);
            }
        });
        begin("clock fixed 1000\n");
        const SyslogCapture::Line error{LOG_ERR,
                                        "Unable to call into KEL in vantel, got error: -52008"};
        EXPECT_TRUE(waitForLog(error.text, 3));
        EXPECT_THAT(log.lines(), Contains(error));
        EXPECT_THAT(host.calls(Function::adjustTime), IsEmpty());
        EXPECT_THAT(qualities(), Contains(usable));
        EXPECT_EQ(metaData().size(), 1U);
        return refused;
    }

    void expectRecovery() {
        ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
        EXPECT_EQ(qualities().back(), usable);
        ASSERT_TRUE(waitUntil([this] { return metaData().back() != defaultMetaData; }));
    }
};

TEST_F(DescriptorFaultTest, NoneForTheSocketFailsEachPoll) {
    const RefusedCalls refused(EMFILE);
    begin("clock fixed 1000\n");
    expectUnreachable(-52000);
    expectStopWithin({});
}

TEST_F(DescriptorFaultTest, OneForTheSocketLaterBringsAll) {
    {
        const RefusedCalls refused(ENFILE);
        begin("clock fixed 1000\n");
        expectUnreachable(-52000);
    }
    expectRecovery();
    expectStopWithin({});
}

TEST_F(DescriptorFaultTest, NoneForTheFifoGivesNoPair) {
    beginWithoutFifo();
    expectStopWithin({});
}

TEST_F(DescriptorFaultTest, OneForTheFifoLaterBringsThePair) {
    const auto refused = beginWithoutFifo();
    refused->reset();
    expectRecovery();
    expectStopWithin({});
}

// Such a socket cannot be waited for: each poll is a time-out, at once.
TEST_F(DescriptorFaultTest, BeyondTheRoomOfASetFailsEachPollAtOnce) {
    {
        const OccupiedDescriptors occupied(FD_SETSIZE);
        if (!occupied.leaveRoom()) {
            GTEST_SKIP() << "this system allows no more than " << FD_SETSIZE << " descriptors";
        }
        const int before = answersAwaited();
        begin("clock fixed 1000\n");
        ASSERT_TRUE(waitForLog(failureLine(-52007), 3));
        EXPECT_EQ(answersAwaited(), before);
        EXPECT_THAT(qualities(), testing::Not(Contains(usable)));
        EXPECT_THAT(metaData(), Each(defaultMetaData));
    }
    expectRecovery();
    expectStopWithin({});
}

TEST_F(DescriptorFaultTest, BeyondTheRoomOfASetDoesNotHoldTheStop) {
    const OccupiedDescriptors occupied(FD_SETSIZE);
    if (!occupied.leaveRoom()) {
        GTEST_SKIP() << "this system allows no more than " << FD_SETSIZE << " descriptors";
    }
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForLog(failureLine(-52007), 2));
    expectStopWithin({});
}

} // namespace
