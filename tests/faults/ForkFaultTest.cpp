// A program in which vfork fails. It stands alone because vfork cannot be passed on: its caller
// returns twice.

#include <cerrno>
#include <csignal>

#include <gmock/gmock.h>
#include <syslog.h>
#include <unistd.h>

#include "FaultTest.h"
#include "Interposed.h"
#include "support/ChildProgram.h"

extern "C" [[gnu::visibility("default")]] pid_t vfork() noexcept {
    errno = EAGAIN;
    return -1;
}

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using ForkFaultTest = FaultTest;

TEST_F(ForkFaultTest, IsReportedAndLeavesNothingRunning) {
    session.initialise();
    HostStatus status;
    EXPECT_NO_THROW(session.start(status));
    EXPECT_EQ(status.code, -52008);
    EXPECT_THAT(status.text(), testing::StartsWith(R"({"error_constant":"zeoskerr_osFault",)"
                                                   R"("file":"tPtp4lTimeRef","line":)"));
    EXPECT_THAT(status.text(), testing::EndsWith(R"(,"component":"vantel_bc"})"));
    EXPECT_THAT(metaData(), ElementsAre(defaultMetaData));
    EXPECT_THAT(qualities(), ElementsAre(waiting));
    EXPECT_EQ(host.calls().size(), 2U);
    EXPECT_THAT(
        log.lines(),
        ElementsAre(
            SyslogCapture::Line{LOG_INFO, std::string("update Meta Data: ") + defaultMetaData},
            SyslogCapture::Line{LOG_ERR, "Unable to fork subprocess in vantel, got errno: Resource "
                                         "temporarily unavailable"}));
    expectOwnThreads(0);
    EXPECT_FALSE(hasChildren());
    expectStopWithin({0, false});
    EXPECT_THAT(sentSignals(), IsEmpty());
}

TEST_F(ForkFaultTest, LeavesTheSignalMaskAsItWas) {
    const BlockedSignals blocked({SIGUSR1});
    session.initialise();
    HostStatus status;
    session.start(status);
    EXPECT_EQ(status.code, -52008);
    EXPECT_THAT(blockedSignals(), ElementsAre(SIGUSR1));
    expectStopWithin({0, false});
}

} // namespace
