#include "tUdsMsgInterface.h"

#include <filesystem>
#include <utility>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "support/DatagramSocket.h"
#include "support/Descriptors.h"
#include "support/ErrorText.h"
#include "support/TemporaryFolder.h"

using zekelVantel::tUdsMsgInterface;

namespace {

constexpr char local[] = "local";

/// Opening and closing.
class UdsMsgInterfaceTest : public testing::Test {
protected:
    void expectError(std::int32_t code, const std::string& constant, int line,
                     const std::string& info = "") {
        EXPECT_EQ(status.code, code);
        EXPECT_EQ(textOf(status), errorText(constant, "tUdsMsgInterface", line, info));
    }

    static bool exists(const std::string& path) {
        return std::filesystem::exists(std::filesystem::symlink_status(path));
    }

    TemporaryFolder folder;
    tUdsMsgInterface interface;
    zeerr::LocalStatus status;
};

TEST_F(UdsMsgInterfaceTest, FreshInterfaceIsClosed) {
    EXPECT_FALSE(interface.isOpen());
}

TEST_F(UdsMsgInterfaceTest, OpeningBindsTheLocalPath) {
    interface.open(local, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_TRUE(interface.isOpen());
    EXPECT_TRUE(std::filesystem::is_socket(local));
    EXPECT_GE(descriptorBoundTo(local), 0);
}

TEST_F(UdsMsgInterfaceTest, DescriptorZeroIsAsGoodAsOthers) {
    const FreeDescriptorZero free;
    interface.open(local, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(descriptorBoundTo(local), 0);
    EXPECT_EQ(interface.close(), 0);
}

TEST_F(UdsMsgInterfaceTest, OpeningTwiceIsBusyAndChangesNothing) {
    interface.open(local, status);
    interface.open("other", status);
    expectError(-52031, "zeoskerr_resourceBusy", 40);
    EXPECT_TRUE(interface.isOpen());
    EXPECT_TRUE(exists(local));
    EXPECT_FALSE(exists("other"));
}

TEST_F(UdsMsgInterfaceTest, NoSocketIsReportedAsMemoryFullWithErrno) {
    // UndefinedBehaviorSanitizer needs a descriptor when it first looks at the object.
    ASSERT_FALSE(interface.isOpen());
    const int lowestFree = dup(STDERR_FILENO);
    ASSERT_EQ(close(lowestFree), 0);
    {
        const DescriptorLimit limit(static_cast<rlim_t>(lowestFree));
        interface.open(local, status);
    }
    expectError(-52000, "zeoskerr_memoryFull", 48,
                "Failed to open socket with errno 24 (Too many open files)");
    EXPECT_FALSE(interface.isOpen());
    EXPECT_FALSE(exists(local));
}

TEST_F(UdsMsgInterfaceTest, BindingInAMissingFolderIsReportedAsResourceNotFoundWithErrno) {
    const int before = openDescriptors();
    interface.open("missing/local", status);
    expectError(-52006, "zeoskerr_resourceNotFound", 65,
                "Failed to bind socket with errno 2 (No such file or directory)");
    EXPECT_FALSE(interface.isOpen());
    EXPECT_EQ(openDescriptors(), before);
}

TEST_F(UdsMsgInterfaceTest, FailedBindLeavesWhatStandsAtThePath) {
    std::filesystem::create_directory(local);
    interface.open(local, status);
    expectError(-52006, "zeoskerr_resourceNotFound", 65,
                "Failed to bind socket with errno 98 (Address already in use)");
    EXPECT_EQ(interface.close(), 0);
    EXPECT_TRUE(exists(local));
}

TEST_F(UdsMsgInterfaceTest, OpensAfterAFailedBind) {
    interface.open("missing/local", status);
    zeerr::LocalStatus second;
    interface.open(local, second);
    EXPECT_EQ(second.code, 0);
    EXPECT_TRUE(interface.isOpen());
}

TEST_F(UdsMsgInterfaceTest, StaleSocketFileIsReplaced) {
    { const DatagramSocket killed(local); }
    ASSERT_TRUE(exists(local));
    interface.open(local, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_TRUE(interface.isOpen());
}

TEST_F(UdsMsgInterfaceTest, SymbolicLinkIsReplacedAndItsTargetStays) {
    writeFile("target", "another's");
    std::filesystem::create_symlink("target", local);
    interface.open(local, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_FALSE(std::filesystem::is_symlink(local));
    interface.close();
    EXPECT_EQ(readFile("target"), "another's");
}

TEST_F(UdsMsgInterfaceTest, SocketIsAsOpenToOthersAsTheMaskOfTheProcessSays) {
    const mode_t before = umask(0);
    for (const auto& [mask, mode] : {std::pair(022U, 0755U), {077U, 0700U}}) {
        umask(mask);
        interface.open(local, status);
        EXPECT_EQ(std::filesystem::status(local).permissions(), std::filesystem::perms(mode));
        interface.close();
    }
    umask(before);
}

TEST_F(UdsMsgInterfaceTest, LocalPathOf200CharactersIsBoundUnderItsFirst107) {
    interface.open(std::string(200, 'a'), status);
    EXPECT_EQ(status.code, 0);
    EXPECT_TRUE(std::filesystem::is_socket(std::string(107, 'a')));
    EXPECT_EQ(interface.close(), 0);
    EXPECT_FALSE(exists(std::string(107, 'a')));
}

TEST_F(UdsMsgInterfaceTest, DescriptorIsClosedOnExec) {
    interface.open(local, status);
    EXPECT_EQ(fcntl(descriptorBoundTo(local), F_GETFD), FD_CLOEXEC);
}

TEST_F(UdsMsgInterfaceTest, ClosingAClosedInterfaceDoesNothing) {
    EXPECT_EQ(interface.close(), 0);
    interface.open(local, status);
    EXPECT_EQ(interface.close(), 0);
    writeFile(local, "another's");
    EXPECT_EQ(interface.close(), 0);
    EXPECT_TRUE(exists(local));
}

TEST_F(UdsMsgInterfaceTest, ClosingRemovesPathAndDescriptor) {
    const int before = openDescriptors();
    interface.open(local, status);
    EXPECT_EQ(interface.close(), 0);
    EXPECT_FALSE(interface.isOpen());
    EXPECT_FALSE(exists(local));
    EXPECT_EQ(openDescriptors(), before);
}

TEST_F(UdsMsgInterfaceTest, ClosingGivesTheResultOfTheSystem) {
    interface.open(local, status);
    ASSERT_EQ(close(descriptorBoundTo(local)), 0);
    EXPECT_EQ(interface.close(), -1);
    EXPECT_FALSE(interface.isOpen());
}

TEST_F(UdsMsgInterfaceTest, ClosingIsNotTroubledByAPathThatIsGone) {
    interface.open(local, status);
    std::filesystem::remove(local);
    EXPECT_EQ(interface.close(), 0);
}

TEST_F(UdsMsgInterfaceTest, DestructionRemovesPathAndDescriptor) {
    const int before = openDescriptors();
    {
        tUdsMsgInterface shortLived;
        shortLived.open(local, status);
        ASSERT_TRUE(exists(local));
    }
    EXPECT_FALSE(exists(local));
    EXPECT_EQ(openDescriptors(), before);
}

TEST_F(UdsMsgInterfaceTest, OpensAgainAfterClosing) {
    interface.open(local, status);
    interface.close();
    interface.open("other", status);
    EXPECT_EQ(status.code, 0);
    EXPECT_FALSE(exists(local));
    EXPECT_TRUE(std::filesystem::is_socket("other"));
}

TEST_F(UdsMsgInterfaceTest, OpeningWithAnErrorDoesNothing) {
    { const DatagramSocket stale(local); }
    status.code = -1;
    interface.open(local, status);
    EXPECT_FALSE(interface.isOpen());
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), "");
    EXPECT_EQ(descriptorBoundTo(local), -1);
    EXPECT_TRUE(exists(local));
}

TEST_F(UdsMsgInterfaceTest, OpeningWithAWarningOpensAndKeepsIt) {
    status.code = 1;
    interface.open(local, status);
    EXPECT_TRUE(interface.isOpen());
    EXPECT_EQ(status.code, 1);
}

TEST_F(UdsMsgInterfaceTest, ErrorReplacesAWarning) {
    status.code = 1;
    interface.open("missing/local", status);
    expectError(-52006, "zeoskerr_resourceNotFound", 65,
                "Failed to bind socket with errno 2 (No such file or directory)");
}

} // namespace
