#include "tFileDescriptor.h"

#include <cerrno>
#include <type_traits>
#include <utility>

#include <fcntl.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include "support/Descriptors.h"

using zekelVantel::tFileDescriptor;

namespace {

static_assert(!std::is_copy_constructible_v<tFileDescriptor>, "one owner of a descriptor");
static_assert(!std::is_copy_assignable_v<tFileDescriptor>, "one owner of a descriptor");
static_assert(std::is_nothrow_move_constructible_v<tFileDescriptor>, "moving is safe");

int openNull() {
    return open("/dev/null", O_RDWR);
}

bool isOpenInTheProcess(int descriptor) {
    return fcntl(descriptor, F_GETFD) != -1;
}

TEST(FileDescriptorTest, DefaultIsNone) {
    const tFileDescriptor none;
    EXPECT_EQ(none.get(), -1);
    EXPECT_FALSE(none.isOpen());
}

TEST(FileDescriptorTest, TakingNoneKeepsWhyThereIsNone) {
    errno = ENOENT;
    EXPECT_FALSE(tFileDescriptor(-1).isOpen());
    EXPECT_EQ(errno, ENOENT);
}

TEST(FileDescriptorTest, NumberZeroIsADescriptorToo) {
    const FreeDescriptorZero free;
    tFileDescriptor descriptor(openNull());
    EXPECT_EQ(descriptor.get(), 0);
    EXPECT_TRUE(descriptor.isOpen());
    EXPECT_EQ(descriptor.close(), 0);
    EXPECT_FALSE(isOpenInTheProcess(0));
}

TEST(FileDescriptorTest, TakenOverDescriptorIsNotInherited) {
    const int number = openNull();
    ASSERT_GE(number, 0);
    ASSERT_EQ(fcntl(number, F_GETFD), 0);
    const tFileDescriptor descriptor(number);
    EXPECT_EQ(descriptor.get(), number);
    EXPECT_TRUE(descriptor.isOpen());
    EXPECT_EQ(fcntl(number, F_GETFD), FD_CLOEXEC);
}

TEST(FileDescriptorTest, DestructionCloses) {
    const int number = openNull();
    {
        const tFileDescriptor descriptor(number);
        ASSERT_TRUE(isOpenInTheProcess(number));
    }
    EXPECT_FALSE(isOpenInTheProcess(number));
}

TEST(FileDescriptorTest, CloseClosesOnce) {
    const int number = openNull();
    tFileDescriptor descriptor(number);
    EXPECT_EQ(descriptor.close(), 0);
    EXPECT_FALSE(isOpenInTheProcess(number));
    EXPECT_EQ(descriptor.get(), -1);
    EXPECT_FALSE(descriptor.isOpen());
    EXPECT_EQ(descriptor.close(), 0);
}

TEST(FileDescriptorTest, CloseReportsFailureAndForgetsTheDescriptor) {
    const int number = openNull();
    tFileDescriptor descriptor(number);
    ASSERT_EQ(::close(number), 0);
    EXPECT_EQ(descriptor.close(), -1);
    EXPECT_EQ(errno, EBADF);
    EXPECT_FALSE(descriptor.isOpen());
}

TEST(FileDescriptorTest, ConstructionByMoveLeavesNone) {
    tFileDescriptor source(openNull());
    const int number = source.get();
    const tFileDescriptor target(std::move(source));
    EXPECT_EQ(target.get(), number);
    EXPECT_EQ(source.get(), -1); // NOLINT: the state after the move is what is tested
    EXPECT_TRUE(isOpenInTheProcess(number));
}

TEST(FileDescriptorTest, AssignmentByMoveKeepsOneAndClosesTheOther) {
    const int former = openNull();
    const int number = openNull();
    {
        tFileDescriptor target(former);
        {
            tFileDescriptor source(number);
            target = std::move(source);
            EXPECT_EQ(target.get(), number);
        }
        EXPECT_FALSE(isOpenInTheProcess(former));
        EXPECT_TRUE(isOpenInTheProcess(number));
    }
    EXPECT_FALSE(isOpenInTheProcess(number));
}

TEST(FileDescriptorTest, AssignmentToItselfKeepsTheDescriptor) {
    tFileDescriptor descriptor(openNull());
    const int number = descriptor.get();
    tFileDescriptor& same = descriptor;
    descriptor = std::move(same);
    EXPECT_EQ(descriptor.get(), number);
    EXPECT_TRUE(isOpenInTheProcess(number));
}

} // namespace
