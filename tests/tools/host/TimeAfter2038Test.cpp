// A program of its own: the system's clock is the test's.

#include <unistd.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vantel_bc/zekel.h>

#include "Callbacks.h"
#include "EventPrinter.h"
#include "HostStatus.h"
#include "support/SystemClock.h"

using namespace vantelhost;

namespace {

std::uint64_t hostTime() {
    Journal journal(EventPrinter(STDOUT_FILENO, Format::jsonLines), [](const std::string&) {});
    Callbacks callbacks(journal, false);
    HostStatus status;
    std::uint64_t time = 0;
    zekel_getTime(callbacks.slot(), &time, status.get());
    EXPECT_EQ(status.code(), 0);
    return time;
}

} // namespace

TEST(TimeAfter2038, GoesOnBeyond32BitsOfSecondsToTheNanosecond) {
    for (const std::int64_t time : {INT64_C(1700000000123456789), INT64_C(2147483647999999999),
                                    INT64_C(2147483648000000000), INT64_C(4294967295999999999),
                                    INT64_C(4294967296000000001), INT64_C(9223372036854775807)}) {
        const StoppedRealtime stopped(time);
        EXPECT_EQ(hostTime(), static_cast<std::uint64_t>(time));
    }
}
