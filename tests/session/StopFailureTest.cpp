#include <atomic>
#include <cstdint>
#include <cstdio>
#include <memory>

#include <gmock/gmock.h>
#include <syslog.h>

#include "SessionFixture.h"

namespace {

using StopFailureTest = SessionTest;

/// What a stop that failed writes, with the low 32 bits of the slot's address.
std::string failureLine(void** slot, int code) {
    char line[128];
    std::snprintf(line, sizeof(line), "Unable to stop vantel session %x, got err: %d",
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(slot) & 0xffffffffU),
                  code);
    return line;
}

// A host must not do this: the worker would wait for itself, which the C++ library refuses.
TEST_F(StopFailureTest, OfAStopFromACallbackShowsInTheLogOnly) {
#ifdef __SANITIZE_THREAD__
    GTEST_SKIP() << "ThreadSanitizer lets a thread wait for itself, which glibc refuses";
#endif
    const auto tried = std::make_shared<std::atomic<bool>>(false);
    host.onCall([=](const RecordingHost::Call& call, zeerr_Status& status) {
        if (call.function == Function::getTime && !tried->exchange(true)) {
            session.stop();
            EXPECT_EQ(status.code, 0);
        }
    });
    begin("gm present\n");
    const std::string line = failureLine(session.slot(), -52003);
    ASSERT_TRUE(waitForLog(line));
    EXPECT_THAT(log.lines(), testing::Contains(SyslogCapture::Line{LOG_ERR, line}));
    session.stop();
    EXPECT_EQ(log.count(line), 1);
    EXPECT_FALSE(hasChildren());
}

} // namespace
