// The plug-in's own socket file, and the folder that it is in.

#include <atomic>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <system_error>
#include <thread>
#include <utility>

#include <gmock/gmock.h>
#include <sys/prctl.h>
#include <unistd.h>

#include "FaultTest.h"

namespace {

using testing::ElementsAre;
using testing::SizeIs;

/// A folder that nobody may write to, while this object lives.
class ReadOnlyFolder {
public:
    /// @param path of this user.
    explicit ReadOnlyFolder(std::string path) : path_(std::move(path)) {
        std::filesystem::permissions(path_, readOnly);
        if (user_ == 0) { // who may do anything
            holds_ = seteuid(65534) == 0;
        }
    }
    ~ReadOnlyFolder() {
        if (user_ == 0 && holds_) {
            EXPECT_EQ(seteuid(user_), 0);
            // Or LeakSanitizer could not look at this process.
            prctl(PR_SET_DUMPABLE, 1);
        }
        std::filesystem::permissions(path_, std::filesystem::perms::owner_all);
    }
    ReadOnlyFolder(const ReadOnlyFolder&) = delete;
    ReadOnlyFolder& operator=(const ReadOnlyFolder&) = delete;

    bool holds() const { return holds_; }

private:
    static constexpr std::filesystem::perms readOnly{0555};
    std::string path_;
    uid_t user_ = geteuid();
    bool holds_ = true;
};

/// Another client of the plug-in's socket, which never pauses.
class Flood {
public:
    explicit Flood(std::string path) : path_(std::move(path)), thread_([this] { run(); }) {}
    ~Flood() {
        ended_ = true;
        thread_.join();
    }
    Flood(const Flood&) = delete;
    Flood& operator=(const Flood&) = delete;

private:
    void run() const {
        const DatagramSocket socket;
        while (!ended_) {
            try {
                socket.fillQueueOf(path_);
            } catch (const std::system_error&) { // nobody is there between two polls
            }
            std::this_thread::yield();
        }
    }

    std::string path_;
    std::atomic<bool> ended_{false};
    std::thread thread_;
};

class OwnSocketTest : public FaultTest {
protected:
    /// Takes the file away, so that answers are lost until the next time-out.
    static void remove() { std::filesystem::remove(socketPath()); }

    /// Waits until a poll fails with a code, after this call.
    void expectOneMore(int code) {
        ASSERT_TRUE(waitForLog(failureLine(code), log.count(failureLine(code)) + 1));
    }

    void leaveForAMissingFolder() const {
        std::filesystem::create_directory("gone");
        std::filesystem::current_path("gone");
        std::filesystem::remove(folder.path("gone"));
    }

    /// Expects that a fault costs one poll, and that the next one has a socket again. Then stops in
    /// the wait that it makes once more. What makes the fault is called in a poll, so that the next
    /// one meets it.
    void expectOneLostPoll(const std::function<void()>& makeFault) {
        const auto isDue = std::make_shared<std::atomic<bool>>(false);
        onEachPoll([=](int) {
            if (isDue->exchange(false)) {
                makeFault();
            }
        });
        beginWell();
        *isDue = true;
        expectFailure(-52007);
        expectSilentRecovery();
        EXPECT_EQ(log.count(failureLine(-52007)), 1);
        EXPECT_TRUE(std::filesystem::is_socket(socketPath()));
        *isDue = true;
        ASSERT_TRUE(waitUntil([=] { return !*isDue; }));
        ASSERT_TRUE(waitUntilAnswerIsAwaited());
        expectStopWithin({1});
        EXPECT_EQ(log.count(failureLine(-52007)), 2);
    }
};

TEST_F(OwnSocketTest, RemovedLosesOnePoll) {
    expectOneLostPoll(remove);
}

TEST_F(OwnSocketTest, ReplacedByAFileLosesOnePoll) {
    expectOneLostPoll([] {
        remove();
        writeFile(socketPath(), "no socket");
    });
}

TEST_F(OwnSocketTest, ReplacedByAnotherLosesOnePoll) {
    const auto thief = std::make_shared<std::optional<DatagramSocket>>();
    expectOneLostPoll([=] {
        remove();
        thief->emplace(socketPath());
    });
    EXPECT_TRUE((*thief)->receiveQueued());
}

TEST_F(OwnSocketTest, ReplacedByAFolderIsAFailureUntilItGoes) {
    beginWell();
    remove();
    std::filesystem::create_directory(socketPath());
    expectFailure(-52007);
    ASSERT_TRUE(waitForLog(failureLine(-52006), 2));
    remove();
    expectSilentRecovery();
    std::filesystem::remove("ptp4l.sock"); // ends the good polls
    // Between two polls there is nothing at the path.
    ASSERT_TRUE(waitUntil([] {
        std::error_code ignored;
        return std::filesystem::create_directory(socketPath(), ignored);
    }));
    expectOneMore(-52006);
    expectStopWithin({});
}

TEST_F(OwnSocketTest, FloodedBySomebodyElseIsAFailureWhileItLasts) {
    beginWell();
    {
        const Flood flood(socketPath());
        expectFailure(-52012);
        ASSERT_TRUE(waitForLog(failureLine(-52012), 3));
    }
    expectSilentRecovery();
    const Flood flood(socketPath());
    helpers.threads = 1;
    expectOneMore(-52012);
    expectStopWithin({});
}

// The folder of this socket and of the daemon's is the working folder of the process.
TEST_F(OwnSocketTest, InAMissingFolderIsAFailureUntilItComes) {
    beginWell();
    leaveForAMissingFolder();
    expectFailure(-52024);
    ASSERT_TRUE(waitForLog(failureLine(-52006), 2));
    std::filesystem::current_path(folder.path());
    expectSilentRecovery();
    leaveForAMissingFolder();
    expectOneMore(-52006);
    expectStopWithin({});
    std::filesystem::current_path(folder.path());
}

TEST_F(OwnSocketTest, InAReadOnlyFolderIsAFailureUntilItIsWritable) {
    beginWell();
    std::filesystem::rename("ptp4l.sock", "elsewhere"); // or it would not be bound anew
    std::optional<ReadOnlyFolder> fault(folder.path());
    if (!fault->holds()) {
        GTEST_SKIP() << "this user may write everywhere and cannot become another one";
    }
    expectFailure(-52024);
    ASSERT_TRUE(waitForLog(failureLine(-52006), 2));
    fault.reset();
    std::filesystem::rename("elsewhere", "ptp4l.sock");
    expectSilentRecovery();
    std::filesystem::remove("ptp4l.sock");
    fault.emplace(folder.path());
    expectOneMore(-52006);
    expectStopWithin({});
}

} // namespace
