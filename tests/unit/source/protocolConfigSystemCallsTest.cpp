// A program of its own: write and newlocale are those below, which can be told what to do.

#include "protocolConfig.h"

#include <algorithm>
#include <cerrno>
#include <deque>
#include <string>

#include <gtest/gtest.h>
#include <locale.h>
#include <sys/syscall.h>
#include <unistd.h>

#include "ProtocolConfigFixture.h"
#include "support/NextFunction.h"

namespace {

/// What one call of write does.
struct Write {
    std::size_t atMost; ///< octets that it takes
    int error;          ///< errno afterwards; fails with it when it takes none and `fails`
    bool fails;
};

constexpr Write interrupted{0, EINTR, true};
constexpr Write refused{0, EIO, true};
// errno is that of an earlier call: it says nothing about this one.
constexpr Write takesNothing{0, EINTR, false};

std::deque<Write> nextWrites; ///< later calls do as they always do
bool isLocaleRefused = false;

} // namespace

extern "C" {

ssize_t write(int descriptor, const void* octets, std::size_t count) {
    if (nextWrites.empty()) {
        return syscall(SYS_write, descriptor, octets, count);
    }
    const Write next = nextWrites.front();
    nextWrites.pop_front();
    if (next.atMost > 0) {
        return syscall(SYS_write, descriptor, octets, std::min(count, next.atMost));
    }
    errno = next.error;
    return next.fails ? -1 : 0;
}

locale_t newlocale(int categories, const char* name, locale_t base) noexcept {
    if (isLocaleRefused) {
        errno = ENOMEM;
        return nullptr;
    }
    return nextFunction<decltype(newlocale)>("newlocale")(categories, name, base);
}

} // extern "C"

namespace {

class ProtocolConfigSystemCallsTest : public ProtocolConfigFixture {
protected:
    ~ProtocolConfigSystemCallsTest() override {
        nextWrites.clear();
        isLocaleRefused = false;
    }

    /// What is in the file after a reading whose first writes do so.
    std::string writtenWith(std::deque<Write> writes) {
        nextWrites = std::move(writes);
        read();
        return written();
    }
};

TEST_F(ProtocolConfigSystemCallsTest, InterruptedWriteIsRepeated) {
    const std::string whole = writtenWith({});
    EXPECT_EQ(writtenWith({interrupted, interrupted}), whole);
    EXPECT_TRUE(nextWrites.empty());
}

TEST_F(ProtocolConfigSystemCallsTest, WriteOfAPartIsFollowedByOneOfTheRest) {
    const std::string whole = writtenWith({});
    EXPECT_EQ(writtenWith({{1, 0, false}, {100, 0, false}, interrupted, {1, 0, false}}), whole);
    EXPECT_TRUE(nextWrites.empty());
}

TEST_F(ProtocolConfigSystemCallsTest, RefusedWriteIsTheLast) {
    EXPECT_EQ(writtenWith({{8, 0, false}, refused}), "[global]");
}

TEST_F(ProtocolConfigSystemCallsTest, WriteThatTakesNothingIsTheLast) {
    EXPECT_EQ(writtenWith({{8, 0, false}, takesNothing}), "[global]");
}

TEST_F(ProtocolConfigSystemCallsTest, WithoutMemoryForALocaleTheHostsStays) {
    const locale_t ofThread = duplocale(LC_GLOBAL_LOCALE);
    ASSERT_NE(ofThread, nullptr);
    uselocale(ofThread);
    isLocaleRefused = true;
    read();
    EXPECT_EQ(uselocale(LC_GLOBAL_LOCALE), ofThread);
    freelocale(ofThread);
    EXPECT_TRUE(writtenHasLine("priority1               128"));
}

} // namespace
