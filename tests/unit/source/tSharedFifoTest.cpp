#include "tSharedFifo.h"

#include <cstring>
#include <filesystem>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "support/Descriptors.h"
#include "support/ErrorText.h"
#include "support/TemporaryFolder.h"
#include "tFileDescriptor.h"

using zekelVantel::tFileDescriptor;
using zekelVantel::tSharedFifo;

namespace {

constexpr char path[] = "./fifo";

struct stat attributesOf(const char* file) {
    struct stat attributes {};
    EXPECT_EQ(stat(file, &attributes), 0) << file;
    return attributes;
}

/// The descriptor of this process that stands for a file; -1 when there is none.
int descriptorOf(const char* file) {
    const struct stat wanted = attributesOf(file);
    for (int descriptor = 0; descriptor < 1024; ++descriptor) {
        struct stat found {};
        if (fstat(descriptor, &found) == 0 && found.st_dev == wanted.st_dev &&
            found.st_ino == wanted.st_ino) {
            return descriptor;
        }
    }
    return -1;
}

class SharedFifoTest : public testing::Test {
protected:
    SharedFifoTest() { EXPECT_EQ(mkfifo(path, 0600), 0); }

    std::string read(tSharedFifo& fifo, std::size_t length = 16) {
        std::string text(length, '\0');
        result = fifo.read(text.data(), length, status);
        return text.substr(0, result > 0 ? static_cast<std::size_t>(result) : 0U);
    }

    static void write(const tFileDescriptor& writer, const std::string& text) {
        EXPECT_EQ(::write(writer.get(), text.data(), text.size()),
                  static_cast<ssize_t>(text.size()));
    }

    TemporaryFolder folder;
    zeerr::LocalStatus status;
    ssize_t result = 0;
};

TEST_F(SharedFifoTest, OwnerReplacesAnExistingFileByAFreshFifoOfMode0600) {
    const mode_t previous = umask(0);
    unlink(path);
    writeFile(path, "a file");
    const tSharedFifo fifo(path, true, status);
    umask(previous);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(attributesOf(path).st_mode, mode_t{S_IFIFO | 0600});
}

TEST_F(SharedFifoTest, OwnerReplacesAnExistingFifo) {
    const tFileDescriptor former(::open(path, O_RDWR | O_NONBLOCK));
    write(former, "old");
    tSharedFifo fifo(path, true, status);
    EXPECT_EQ(read(fifo), "");
    EXPECT_EQ(status.code, -52012);
}

TEST_F(SharedFifoTest, ConstructionOpensNothing) {
    const tSharedFifo owner(path, true, status);
    EXPECT_FALSE(owner.isOpen());
    EXPECT_EQ(descriptorOf(path), -1);
    const tSharedFifo other(path, false, status);
    EXPECT_FALSE(other.isOpen());
    EXPECT_EQ(descriptorOf(path), -1);
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, NonOwnerLeavesWhateverStandsAtThePath) {
    unlink(path);
    writeFile(path, "a file");
    {
        const tSharedFifo fifo(path, false, status);
        EXPECT_EQ(readFile(path), "a file");
    }
    EXPECT_EQ(readFile(path), "a file");
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, NonOwnerCreatesNothing) {
    unlink(path);
    { const tSharedFifo fifo(path, false, status); }
    EXPECT_FALSE(std::filesystem::exists(path));
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, OwnerRemovesTheFifoInTheEnd) {
    { const tSharedFifo fifo(path, true, status); }
    EXPECT_FALSE(std::filesystem::exists(path));
}

TEST_F(SharedFifoTest, DestructionClosesTheDescriptor) {
    {
        tSharedFifo fifo(path, false, status);
        fifo.open(status);
        EXPECT_NE(descriptorOf(path), -1);
    }
    EXPECT_EQ(descriptorOf(path), -1);
}

TEST_F(SharedFifoTest, OwnerOpensForBothDirectionsAndTheOtherForReading) {
    tSharedFifo owner(path, true, status);
    owner.open(status);
    EXPECT_TRUE(owner.isOpen());
    const int ownerFlags = fcntl(descriptorOf(path), F_GETFL);
    EXPECT_EQ(ownerFlags & O_ACCMODE, O_RDWR);
    EXPECT_EQ(ownerFlags & O_NONBLOCK, O_NONBLOCK);
    owner.close();
    tSharedFifo other(path, false, status);
    other.open(status);
    EXPECT_TRUE(other.isOpen());
    const int otherFlags = fcntl(descriptorOf(path), F_GETFL);
    EXPECT_EQ(otherFlags & O_ACCMODE, O_RDONLY);
    EXPECT_EQ(otherFlags & O_NONBLOCK, O_NONBLOCK);
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, ChildProcessesDoNotInheritTheDescriptor) {
    tSharedFifo fifo(path, false, status);
    fifo.open(status);
    EXPECT_EQ(fcntl(descriptorOf(path), F_GETFD), FD_CLOEXEC);
}

TEST_F(SharedFifoTest, FirstReadOpens) {
    const tFileDescriptor writer(::open(path, O_RDWR | O_NONBLOCK));
    write(writer, "12345678");
    tSharedFifo fifo(path, false, status);
    EXPECT_EQ(read(fifo), "12345678");
    EXPECT_TRUE(fifo.isOpen());
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, ReadTakesNoMoreThanWasAskedFor) {
    const tFileDescriptor writer(::open(path, O_RDWR | O_NONBLOCK));
    write(writer, "1234567890");
    tSharedFifo fifo(path, false, status);
    EXPECT_EQ(read(fifo, 8), "12345678");
    EXPECT_EQ(read(fifo, 8), "90");
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, EmptyReadIsEndOfDataAndStaysOpen) {
    const tFileDescriptor writer(::open(path, O_RDWR | O_NONBLOCK));
    tSharedFifo fifo(path, false, status);
    EXPECT_EQ(read(fifo), "");
    EXPECT_EQ(result, -1);
    EXPECT_EQ(status.code, -52012);
    EXPECT_EQ(textOf(status), errorText("zeoskerr_endOfData", "tSharedFifo", 82,
                                        "Failed reading from shared FIFO: ./fifo, errno: 11 "
                                        "(Resource temporarily unavailable)"));
    EXPECT_TRUE(fifo.isOpen());
    const int descriptor = descriptorOf(path);
    write(writer, "later");
    zeerr::LocalStatus fresh;
    char text[5];
    EXPECT_EQ(fifo.read(text, sizeof(text), fresh), 5);
    EXPECT_EQ(std::memcmp(text, "later", 5), 0);
    EXPECT_EQ(descriptorOf(path), descriptor);
}

TEST_F(SharedFifoTest, ReadWithoutAWriterGivesNoOctetsAndNoError) {
    tSharedFifo fifo(path, false, status);
    EXPECT_EQ(read(fifo), "");
    EXPECT_EQ(result, 0);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(textOf(status), "");
    EXPECT_TRUE(fifo.isOpen());
}

TEST_F(SharedFifoTest, WritersMayComeAndGo) {
    tSharedFifo fifo(path, false, status);
    for (const std::string text : {"first", "second"}) {
        EXPECT_EQ(read(fifo), "");
        const tFileDescriptor writer(::open(path, O_WRONLY | O_NONBLOCK));
        write(writer, text);
        EXPECT_EQ(read(fifo), text);
    }
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, OwnersEndCountsAsAWriter) {
    tSharedFifo fifo(path, true, status);
    EXPECT_EQ(read(fifo), "");
    EXPECT_EQ(status.code, -52012);
}

TEST_F(SharedFifoTest, NonOwnerReadsWhatTheOwnersPartyWrites) {
    tSharedFifo owner(path, true, status);
    owner.open(status);
    tSharedFifo other(path, false, status);
    ASSERT_EQ(::write(descriptorOf(path), "12345678", 8), 8);
    EXPECT_EQ(read(other), "12345678");
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, OctetsThatTheOwnerWritesArriveAtTheOtherEnd) {
    tSharedFifo owner(path, true, status);
    EXPECT_EQ(owner.write("1234\000678", 8, status), 8);
    tSharedFifo other(path, false, status);
    EXPECT_EQ(read(other), std::string("1234\000678", 8));
    EXPECT_EQ(owner.write("90", 2, status), 2);
    EXPECT_EQ(read(other), "90");
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(textOf(status), "");
}

TEST_F(SharedFifoTest, FirstWriteOpensAndAWriteAfterCloseOpensAgain) {
    tSharedFifo fifo(path, true, status);
    EXPECT_FALSE(fifo.isOpen());
    EXPECT_EQ(fifo.write("1", 1, status), 1);
    EXPECT_TRUE(fifo.isOpen());
    const tFileDescriptor reader(::open(path, O_RDONLY | O_NONBLOCK));
    fifo.close();
    EXPECT_EQ(fifo.write("2", 1, status), 1);
    EXPECT_TRUE(fifo.isOpen());
    EXPECT_EQ(read(fifo), "12");
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, WriteGoesWhereTheFirstOneWent) {
    tSharedFifo fifo(path, true, status);
    EXPECT_EQ(fifo.write("1", 1, status), 1);
    ASSERT_EQ(rename(path, "elsewhere"), 0);
    EXPECT_EQ(fifo.write("2", 1, status), 1);
    EXPECT_EQ(read(fifo), "12");
    EXPECT_EQ(status.code, 0);
    ASSERT_EQ(rename("elsewhere", path), 0);
}

TEST_F(SharedFifoTest, WriteOfNothingSucceeds) {
    tSharedFifo fifo(path, true, status);
    EXPECT_EQ(fifo.write("", 0, status), 0);
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, DescriptorZeroIsAsGoodAsOthers) {
    tSharedFifo fifo(path, true, status);
    const FreeDescriptorZero free;
    fifo.open(status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(descriptorOf(path), 0);
    fifo.close();
}

TEST_F(SharedFifoTest, WriteTakesWhatThereIsRoomFor) {
    tSharedFifo fifo(path, true, status);
    const std::string text(100000, 'x');
    EXPECT_EQ(fifo.write(text.data(), text.size(), status), static_cast<ssize_t>(fifo.capacity()));
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoTest, ClosedFifoIsOpenedAgainByARead) {
    const tFileDescriptor writer(::open(path, O_RDWR | O_NONBLOCK));
    tSharedFifo fifo(path, false, status);
    fifo.open(status);
    fifo.close();
    EXPECT_FALSE(fifo.isOpen());
    write(writer, "again");
    EXPECT_EQ(read(fifo), "again");
    EXPECT_TRUE(fifo.isOpen());
}

TEST_F(SharedFifoTest, CapacityIsThatOfThePipe) {
    const tFileDescriptor writer(::open(path, O_RDWR | O_NONBLOCK));
    tSharedFifo fifo(path, false, status);
    fifo.open(status);
    EXPECT_EQ(fifo.capacity(), 65536U);
    const int octets = fcntl(writer.get(), F_SETPIPE_SZ, 16384);
    ASSERT_GE(octets, 16384);
    EXPECT_EQ(fifo.capacity(), static_cast<std::size_t>(octets));
}

TEST_F(SharedFifoTest, CapacityOfWhatIsNoPipeIsTheUsualOne) {
    tSharedFifo fifo(path, false, status);
    EXPECT_EQ(fifo.capacity(), 65536U);
    unlink(path);
    writeFile(path, "a file");
    fifo.open(status);
    EXPECT_TRUE(fifo.isOpen());
    EXPECT_EQ(fifo.capacity(), 65536U);
}

} // namespace
