#include "tSharedFifo.h"

#include <filesystem>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include "errors/Trace.h"
#include "support/ErrorText.h"
#include "support/TemporaryFolder.h"

using testing::EndsWith;
using testing::StartsWith;
using zekelVantel::tSharedFifo;

namespace {

std::string traced;

class SharedFifoFailuresTest : public testing::Test {
protected:
    SharedFifoFailuresTest() {
        traced.clear();
        zesdbg::settings.output = [](const char* line) { traced += line; };
    }
    ~SharedFifoFailuresTest() override { zesdbg::settings = defaults; }

    ssize_t read(tSharedFifo& fifo) {
        char text[8];
        return fifo.read(text, sizeof(text), status);
    }

    /// Opens a FIFO, and closes its descriptor behind its back.
    void openAndLose(tSharedFifo& fifo) {
        const int lowestFree = dup(STDERR_FILENO);
        ::close(lowestFree);
        fifo.open(status);
        ASSERT_EQ(::close(lowestFree), 0) << "that of the FIFO";
    }

    void expectError(std::int32_t code, const std::string& constant, int line,
                     const std::string& info) {
        EXPECT_EQ(status.code, code);
        EXPECT_EQ(textOf(status), errorText(constant, "tSharedFifo", line, info));
    }

    const zesdbg::Settings defaults = zesdbg::settings;
    TemporaryFolder folder;
    zeerr::LocalStatus status;
};

TEST_F(SharedFifoFailuresTest, OwnerThatCannotCreateTheFifoGetsAnOsFault) {
    const tSharedFifo fifo("./missing/fifo", true, status);
    expectError(
        -52008, "zeoskerr_osFault", 35,
        "Failed creating shared FIFO: ./missing/fifo, errno: 2 (No such file or directory)");
}

TEST_F(SharedFifoFailuresTest, OwnerCannotReplaceAFolder) {
    std::filesystem::create_directory("fifo");
    {
        const tSharedFifo fifo("./fifo", true, status);
        expectError(-52008, "zeoskerr_osFault", 35,
                    "Failed creating shared FIFO: ./fifo, errno: 17 (File exists)");
    }
    EXPECT_TRUE(std::filesystem::is_directory("fifo"));
}

TEST_F(SharedFifoFailuresTest, NonOwnerWithoutAFifoGetsResourceNotFoundOnItsFirstRead) {
    tSharedFifo fifo("./fifo", false, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(read(fifo), -1);
    expectError(-52006, "zeoskerr_resourceNotFound", 139,
                "Failed opening shared FIFO: ./fifo, errno: 2 (No such file or directory)");
    EXPECT_FALSE(fifo.isOpen());
}

TEST_F(SharedFifoFailuresTest, FifoThatAppearsLaterIsFoundByTheNextRead) {
    tSharedFifo fifo("./fifo", false, status);
    EXPECT_EQ(read(fifo), -1);
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    zeerr::LocalStatus fresh;
    char text[8];
    EXPECT_EQ(fifo.read(text, sizeof(text), fresh), 0);
    EXPECT_EQ(fresh.code, 0);
}

TEST_F(SharedFifoFailuresTest, OpeningThatFailsOtherwiseIsAnOsFault) {
    writeFile("file", "");
    tSharedFifo fifo("./file/fifo", false, status);
    fifo.open(status);
    expectError(-52008, "zeoskerr_osFault", 143,
                "Failed opening shared FIFO: ./file/fifo, errno: 20 (Not a directory)");
    EXPECT_FALSE(fifo.isOpen());
}

TEST_F(SharedFifoFailuresTest, OwnerThatFindsAFolderInItsPlaceCannotOpen) {
    tSharedFifo fifo("./fifo", true, status);
    unlink("fifo");
    std::filesystem::create_directory("fifo");
    EXPECT_EQ(read(fifo), -1);
    expectError(-52008, "zeoskerr_osFault", 143,
                "Failed opening shared FIFO: ./fifo, errno: 21 (Is a directory)");
}

TEST_F(SharedFifoFailuresTest, FolderAtThePathCanBeOpenedButNotRead) {
    std::filesystem::create_directory("fifo");
    tSharedFifo fifo("./fifo", false, status);
    EXPECT_EQ(read(fifo), -1);
    expectError(-52008, "zeoskerr_osFault", 86,
                "Failed reading from shared FIFO: ./fifo, errno: 21 (Is a directory)");
    EXPECT_TRUE(fifo.isOpen());
}

TEST_F(SharedFifoFailuresTest, RegularFileAtThePathIsReadLikeOne) {
    writeFile("fifo", "123456789");
    tSharedFifo fifo("./fifo", false, status);
    EXPECT_EQ(read(fifo), 8);
    EXPECT_EQ(read(fifo), 1);
    EXPECT_EQ(read(fifo), 0);
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoFailuresTest, SymbolicLinkIsFollowed) {
    const std::int64_t value = 7;
    writeFile("elsewhere", {reinterpret_cast<const char*>(&value), sizeof(value)});
    ASSERT_EQ(symlink("elsewhere", "./fifo"), 0);
    tSharedFifo fifo("./fifo", false, status);
    std::int64_t read = 0;
    EXPECT_EQ(fifo.read(&read, sizeof(read), status), 8);
    EXPECT_EQ(read, 7);
}

/// Opens a terminal as a FIFO, as a daemon does that leads a session without a terminal.
/// @return whether the process has a terminal then.
bool getsATerminal(const std::string& terminal) {
    const pid_t daemon = fork();
    if (daemon == 0) {
        setsid();
        zeerr::LocalStatus status;
        tSharedFifo fifo(terminal, false, status);
        fifo.open(status);
        const bool opened = fifo.isOpen();
        _exit(!opened ? 2 : ::open("/dev/tty", O_RDWR) >= 0 ? 1 : 0);
    }
    int result = 0;
    EXPECT_EQ(waitpid(daemon, &result, 0), daemon);
    EXPECT_NE(WEXITSTATUS(result), 2) << "not opened";
    return WEXITSTATUS(result) == 1;
}

TEST_F(SharedFifoFailuresTest, TerminalAtThePathDoesNotBecomeTheHosts) {
    const zekelVantel::tFileDescriptor master(posix_openpt(O_RDWR | O_NOCTTY));
    if (!master.isOpen() || grantpt(master.get()) != 0 || unlockpt(master.get()) != 0) {
        GTEST_SKIP() << "no pseudo-terminals here";
    }
    char terminal[64];
    ASSERT_EQ(ptsname_r(master.get(), terminal, sizeof(terminal)), 0);
    EXPECT_FALSE(getsATerminal(terminal));
}

TEST_F(SharedFifoFailuresTest, StatusWithAnErrorCreatesNothing) {
    writeFile("fifo", "a file");
    status.code = -1;
    const tSharedFifo fifo("./fifo", true, status);
    EXPECT_EQ(readFile("fifo"), "a file");
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), "");
}

TEST_F(SharedFifoFailuresTest, StatusWithAnErrorOpensAndReadsNothing) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    tSharedFifo fifo("./fifo", false, status);
    status.code = -1;
    fifo.open(status);
    EXPECT_FALSE(fifo.isOpen());
    EXPECT_EQ(read(fifo), -1);
    EXPECT_FALSE(fifo.isOpen());
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), "");
}

TEST_F(SharedFifoFailuresTest, StatusWithAnErrorReadsNothingFromAnOpenFifo) {
    writeFile("fifo", "12345678");
    tSharedFifo fifo("./fifo", false, status);
    fifo.open(status);
    zeerr::LocalStatus failed;
    failed.code = -1;
    char text[8];
    EXPECT_EQ(fifo.read(text, sizeof(text), failed), -1);
    EXPECT_EQ(read(fifo), 8);
}

TEST_F(SharedFifoFailuresTest, StatusWithAWarningHindersNothing) {
    status.code = 3;
    tSharedFifo fifo("./fifo", true, status);
    EXPECT_TRUE(std::filesystem::is_fifo("fifo"));
    EXPECT_EQ(read(fifo), -1);
    EXPECT_EQ(status.code, -52012);
}

TEST_F(SharedFifoFailuresTest, NonOwnersEndIsReadOnly) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    tSharedFifo fifo("./fifo", false, status);
    EXPECT_EQ(fifo.write("12345678", 8, status), -1);
    expectError(-52008, "zeoskerr_osFault", 112,
                "Failed writing to shared FIFO: ./fifo, errno: 9 (Bad file descriptor)");
    EXPECT_TRUE(fifo.isOpen());
}

TEST_F(SharedFifoFailuresTest, FullFifoIsAnOsFaultAndStaysOpen) {
    tSharedFifo fifo("./fifo", true, status);
    fifo.open(status);
    const std::string text(fifo.capacity(), 'x');
    ASSERT_EQ(fifo.write(text.data(), text.size(), status), static_cast<ssize_t>(text.size()));
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(fifo.write("12345678", 8, status), -1);
    expectError(
        -52008, "zeoskerr_osFault", 112,
        "Failed writing to shared FIFO: ./fifo, errno: 11 (Resource temporarily unavailable)");
    EXPECT_TRUE(fifo.isOpen());
}

TEST_F(SharedFifoFailuresTest, WriteThatCannotOpenFailsLikeARead) {
    tSharedFifo fifo("./fifo", true, status);
    unlink("fifo");
    EXPECT_EQ(fifo.write("12345678", 8, status), -1);
    expectError(-52006, "zeoskerr_resourceNotFound", 139,
                "Failed opening shared FIFO: ./fifo, errno: 2 (No such file or directory)");
    EXPECT_FALSE(fifo.isOpen());
}

TEST_F(SharedFifoFailuresTest, StatusWithAnErrorWritesNothing) {
    tSharedFifo fifo("./fifo", true, status);
    zeerr::LocalStatus failed;
    failed.code = -1;
    EXPECT_EQ(fifo.write("12345678", 8, failed), -1);
    EXPECT_FALSE(fifo.isOpen());
    fifo.open(status);
    EXPECT_EQ(fifo.write("12345678", 8, failed), -1);
    EXPECT_EQ(failed.code, -1);
    EXPECT_EQ(textOf(failed), "");
    EXPECT_EQ(read(fifo), -1);
    EXPECT_EQ(status.code, -52012);
}

TEST_F(SharedFifoFailuresTest, StatusWithAWarningHindersNoWrite) {
    status.code = 3;
    tSharedFifo fifo("./fifo", true, status);
    EXPECT_EQ(fifo.write("12345678", 8, status), 8);
    EXPECT_EQ(status.code, 3);
    EXPECT_EQ(read(fifo), 8);
}

TEST_F(SharedFifoFailuresTest, FailingUnlinkIsTracedOnly) {
    {
        const tSharedFifo fifo("./fifo", true, status);
        unlink("fifo");
    }
    EXPECT_THAT(traced, StartsWith("[ vantel_bc|                     tSharedFifo|"));
    EXPECT_THAT(traced, EndsWith("] Failed unlinking shared FIFO: ./fifo, errno: 2 "
                                 "(No such file or directory)\n"));
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoFailuresTest, FailingCloseIsTracedOnlyAndLeavesTheFifoClosed) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    tSharedFifo fifo("./fifo", false, status);
    openAndLose(fifo);
    fifo.close();
    EXPECT_THAT(traced, StartsWith("[ vantel_bc|                     tSharedFifo|"));
    EXPECT_THAT(traced, EndsWith("] Failed closing shared FIFO: ./fifo, errno: 9 "
                                 "(Bad file descriptor)\n"));
    EXPECT_FALSE(fifo.isOpen());
    EXPECT_EQ(status.code, 0);
}

TEST_F(SharedFifoFailuresTest, EndOfAnOpenFifoTracesThatClosingFails) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    {
        tSharedFifo fifo("./fifo", false, status);
        openAndLose(fifo);
    }
    EXPECT_THAT(traced, EndsWith("] Failed closing shared FIFO: ./fifo, errno: 9 "
                                 "(Bad file descriptor)\n"));
}

TEST_F(SharedFifoFailuresTest, AreTracedUpToTheirLevel) {
    for (const std::uint32_t threshold : {0x2000U, 0x2001U}) {
        traced.clear();
        zesdbg::settings.threshold = threshold;
        {
            tSharedFifo fifo("./fifo", true, status);
            fifo.open(status);
            unlink("fifo");
        }
        EXPECT_EQ(traced.empty(), threshold > 0x2000) << traced;
    }
}

TEST_F(SharedFifoFailuresTest, ClosingIsTracedUpToItsLevel) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    for (const std::uint32_t threshold : {0x2000U, 0x2001U}) {
        traced.clear();
        zesdbg::settings.threshold = threshold;
        tSharedFifo fifo("./fifo", false, status);
        openAndLose(fifo);
        fifo.close();
        EXPECT_EQ(traced.empty(), threshold > 0x2000) << traced;
    }
}

TEST_F(SharedFifoFailuresTest, SuccessTracesNothing) {
    {
        tSharedFifo fifo("./fifo", true, status);
        fifo.open(status);
        fifo.close();
        fifo.close();
    }
    EXPECT_EQ(traced, "");
}

} // namespace
