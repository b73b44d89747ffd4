// A program in which vfork fails. It stands alone because vfork cannot be passed on: its caller
// returns twice.

#include <cerrno>
#include <csignal>

#include <gmock/gmock.h>
#include <syslog.h>
#include <unistd.h>

#include "Interposed.h"
#include "SessionFixture.h"

extern "C" [[gnu::visibility("default")]] pid_t vfork() noexcept {
    errno = EAGAIN;
    return -1;
}

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using ForkFailureTest = SessionTest;

TEST_F(ForkFailureTest, IsReportedAndLogged) {
    session.initialise();
    HostStatus status;
    EXPECT_NO_THROW(session.start(status));
    EXPECT_EQ(status.code, -52008);
    EXPECT_THAT(status.text(), testing::StartsWith(R"({"error_constant":"zeoskerr_osFault",)"
                                                   R"("file":"tPtp4lTimeRef","line":)"));
    EXPECT_THAT(status.text(), testing::EndsWith(R"(,"component":"vantel_bc"})"));
    EXPECT_THAT(
        log.lines(),
        testing::ElementsAre(
            SyslogCapture::Line{LOG_INFO, std::string("update Meta Data: ") + defaultMetaData},
            SyslogCapture::Line{
                LOG_ERR, "Unable to fork subprocess in vantel, got errno: Resource temporarily "
                         "unavailable"}));
}

TEST_F(ForkFailureTest, ComesAfterTheFirstReports) {
    session.initialise();
    HostStatus status;
    session.start(status);
    const auto calls = host.calls();
    ASSERT_EQ(calls.size(), 2U);
    EXPECT_EQ(calls[0].text, defaultMetaData);
    EXPECT_EQ(calls[1].text, "Waiting for ptp4l status");
}

TEST_F(ForkFailureTest, LeavesNothingRunning) {
    session.initialise();
    HostStatus status;
    session.start(status);
    expectOwnThreads(0);
    EXPECT_FALSE(hasChildren());
    session.stop();
    EXPECT_THAT(sentSignals(), IsEmpty());
}

TEST_F(ForkFailureTest, LeavesTheSignalMaskAsItWas) {
    sigset_t blocked;
    sigemptyset(&blocked);
    sigaddset(&blocked, SIGUSR1);
    sigset_t before;
    pthread_sigmask(SIG_BLOCK, &blocked, &before);
    session.initialise();
    HostStatus status;
    session.start(status);
    sigset_t after;
    pthread_sigmask(SIG_SETMASK, &before, &after);
    EXPECT_EQ(sigismember(&after, SIGUSR1), 1);
    EXPECT_EQ(sigismember(&after, SIGTERM), sigismember(&before, SIGTERM));
}

} // namespace
