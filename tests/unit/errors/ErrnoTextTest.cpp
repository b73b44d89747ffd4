#include "errors/ErrnoText.h"

#include <string>
#include <thread>

#include <gtest/gtest.h>

namespace {

TEST(ErrnoTextTest, KeepsNumberAndTextOfItsMoment) {
    errno = ENOENT;
    const zeerr::ErrnoText first;
    errno = EACCES;
    const zeerr::ErrnoText second;
    errno = 0;
    EXPECT_EQ(first.number(), 2);
    EXPECT_STREQ(first.text(), "No such file or directory");
    EXPECT_EQ(second.number(), 13);
    EXPECT_STREQ(second.text(), "Permission denied");
}

TEST(ErrnoTextTest, UnknownNumbersHaveATextOfTheirOwn) {
    errno = 12345;
    const zeerr::ErrnoText first;
    errno = 54321;
    const zeerr::ErrnoText second;
    EXPECT_STREQ(first.text(), "Unknown error 12345");
    EXPECT_STREQ(second.text(), "Unknown error 54321");
}

TEST(ErrnoTextTest, ThreadsDoNotDisturbEachOther) {
    errno = 1001;
    const zeerr::ErrnoText here;
    std::string there;
    std::thread([&] {
        errno = 2002;
        there = zeerr::ErrnoText().text();
    }).join();
    EXPECT_STREQ(here.text(), "Unknown error 1001");
    EXPECT_EQ(there, "Unknown error 2002");
}

} // namespace
