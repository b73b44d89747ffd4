#include "EpochFifo.h"

#include <array>
#include <system_error>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Checks/OrdinaryUser.h"
#include "Tool.h"
#include "UsageError.h"

using namespace vantelhost;

namespace {

class EpochFifoTest : public testing::Test {
protected:
    /// The mode, 0 when there is nothing.
    mode_t mode() const {
        struct stat status {};
        return ::lstat(path.c_str(), &status) == 0 ? status.st_mode : 0;
    }

    Folder folder;
    std::string path = folder.path("fifo");
};

} // namespace

TEST_F(EpochFifoTest, IsCreatedForItsUserOnlyAndRemovedAtTheEnd) {
    {
        const EpochFifo fifo(path, EpochFifo::Absent::create);
        EXPECT_EQ(mode(), static_cast<mode_t>(S_IFIFO | 0600));
    }
    EXPECT_EQ(mode(), 0U);
}

TEST_F(EpochFifoTest, AnExistingFifoIsUsedAndLeft) {
    ASSERT_EQ(::mkfifo(path.c_str(), 0640), 0);
    { const EpochFifo fifo(path, EpochFifo::Absent::create); }
    EXPECT_EQ(mode(), static_cast<mode_t>(S_IFIFO | 0640));
}

TEST_F(EpochFifoTest, AnAbsentFifoIsRefusedUnlessItMayBeCreated) {
    EXPECT_THROW(EpochFifo(path, EpochFifo::Absent::refuse), UsageError);
    EXPECT_EQ(mode(), 0U);
}

TEST_F(EpochFifoTest, SomethingElseIsRefusedAndLeft) {
    writeFile(path, "mine");
    EXPECT_THROW(EpochFifo(path, EpochFifo::Absent::create), UsageError);
    EXPECT_EQ(contentOf(path), "mine");
}

TEST_F(EpochFifoTest, ALinkToAFifoIsRefused) {
    const auto target = folder.path("target");
    ASSERT_EQ(::mkfifo(target.c_str(), 0600), 0);
    ASSERT_EQ(::symlink(target.c_str(), path.c_str()), 0);
    EXPECT_THROW(EpochFifo(path, EpochFifo::Absent::create), UsageError);
}

TEST_F(EpochFifoTest, AFifoThatMayOnlyBeReadIsHeldAndNotWritten) {
    ASSERT_EQ(::mkfifo(path.c_str(), 0444), 0);
    ::chmod(folder.path("").c_str(), 0755);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    for (const auto absent : {EpochFifo::Absent::refuse, EpochFifo::Absent::create}) {
        EXPECT_NO_THROW(EpochFifo(path, absent, EpochFifo::Use::hold));
        EXPECT_THROW(EpochFifo(path, absent, EpochFifo::Use::write), UsageError);
    }
    EXPECT_TRUE(S_ISFIFO(mode()));
}

TEST_F(EpochFifoTest, AFifoThatReplacedItIsLeft) {
    {
        const EpochFifo fifo(path, EpochFifo::Absent::create);
        ASSERT_EQ(::rename(path.c_str(), folder.path("old").c_str()), 0);
        ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
    }
    EXPECT_TRUE(S_ISFIFO(mode()));
}

TEST_F(EpochFifoTest, OffsetsWaitForTheReaderAsEightOctetsInHostOrder) {
    EpochFifo fifo(path, EpochFifo::Absent::create);
    fifo.write(-2);
    fifo.write(0x0102030405060708);
    const int reader = ::open(path.c_str(), O_RDONLY | O_NONBLOCK);
    std::array<unsigned char, 17> octets{};
    EXPECT_EQ(::read(reader, octets.data(), octets.size()), 16);
    ::close(reader);
#if __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__
    const std::array<unsigned char, 17> expected{0xFE, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF,
                                                 8,    7,    6,    5,    4,    3,    2,    1};
    EXPECT_EQ(octets, expected);
#endif
}

TEST_F(EpochFifoTest, AFullFifoIsAnErrorAndDoesNotBlock) {
    EpochFifo fifo(path, EpochFifo::Absent::create);
    const auto fill = [&] {
        for (int i = 0; i < 1000000; ++i) {
            fifo.write(i);
        }
    };
    EXPECT_THROW(fill(), std::system_error);
}
