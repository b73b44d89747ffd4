// A path at which ptp4l's configuration file cannot be written. Nobody checks that; the daemon
// fails, or comes up without its configuration, and does not answer.

#include <algorithm>
#include <csignal>
#include <filesystem>

#include <gmock/gmock.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <syslog.h>

#include "FaultTest.h"
#include "support/ChildProgram.h"

namespace {

using testing::Contains;
using testing::Each;
using testing::IsEmpty;
using testing::Not;

/// A file system with room for so many octets of a file, while this object lives.
class FullFileSystem {
public:
    explicit FullFileSystem(rlim_t room) : ignored_(SIGXFSZ, SIG_IGN) {
        getrlimit(RLIMIT_FSIZE, &before_);
        const rlimit limit{room, before_.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FullFileSystem() { setrlimit(RLIMIT_FSIZE, &before_); }
    FullFileSystem(const FullFileSystem&) = delete;
    FullFileSystem& operator=(const FullFileSystem&) = delete;

private:
    Disposition ignored_;
    rlimit before_{};
};

class ConfigurationFileFaultTest : public FaultTest {
protected:
    void initialise(const std::string& path) {
        std::string text = sessionConfiguration();
        const std::string usual = SimulatedDaemon::configFile;
        session.initialise(text.replace(text.find(usual), usual.size(), path));
        EXPECT_THAT(log.lines(), IsEmpty());
    }

    /// With a daemon that leaves the socket of its configuration alone: it does not know it.
    void initialiseWithRoomFor(rlim_t octets) {
        writeFile("full.conf.sim", "start-delay 1000000\n");
        const FullFileSystem full(octets);
        initialise("full.conf");
    }

    /// Runs the session with a daemon that never gets as far as to answer.
    void expectUnreachable() {
        session.start();
        ASSERT_TRUE(waitForLog(failureLine(-52024), 3));
        ASSERT_TRUE(waitForCalls(Function::updateMetaData, 4));
        EXPECT_EQ(qualities().at(0), waiting);
        EXPECT_EQ(qualities().at(1), unreachable);
        EXPECT_THAT(qualities(), Not(Contains(usable)));
        EXPECT_THAT(metaData(), Each(defaultMetaData));
        EXPECT_THAT(log.lines(), Each(testing::Field(&SyslogCapture::Line::priority, LOG_INFO)));
    }
};

TEST_F(ConfigurationFileFaultTest, MissingFolderEndsTheDaemon) {
    initialise("missing/ptp4l.conf");
    expectUnreachable();
    EXPECT_TRUE(waitUntil([&] { return !hasChildren(); }));
    EXPECT_TRUE(waitUntil([&] {
        const auto reports = qualities();
        return std::find(reports.begin(), reports.end(), died) != reports.end();
    }));
    expectStopWithin({});
}

TEST_F(ConfigurationFileFaultTest, FolderAtThePathLeavesTheDaemonUnreachable) {
    std::filesystem::create_directory("folder");
    writeFile("folder.sim", "start-delay 1000000\n");
    initialise("folder");
    expectUnreachable();
    expectStopWithin({});
}

// A daemon that opens it waits there for a writer.
TEST_F(ConfigurationFileFaultTest, FifoAtThePathHoldsTheDaemonOnly) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    initialise("fifo");
    expectUnreachable();
    EXPECT_TRUE(hasChildren());
    expectStopWithin({});
}

TEST_F(ConfigurationFileFaultTest, FullFileSystemLeavesTheDaemonUnreachable) {
    initialiseWithRoomFor(0);
    EXPECT_EQ(readFile("full.conf"), "");
    expectUnreachable();
    expectStopWithin({});
}

TEST_F(ConfigurationFileFaultTest, FileSystemThatFillsUpCutsTheFile) {
    initialiseWithRoomFor(100);
    EXPECT_EQ(readFile("full.conf"), R"([global]
#
# Default Data Set
#
twoStepFlag             1
gmCapable               1
priority1       )");
    expectUnreachable();
    expectStopWithin({});
}

// Not started: whoever reads this device never comes to its end.
TEST_F(ConfigurationFileFaultTest, FullDeviceDoesNotHoldTheHost) {
    initialise("/dev/full");
    expectStopWithin({0, false});
}

} // namespace
