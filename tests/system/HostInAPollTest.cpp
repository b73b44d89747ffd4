// A host that is stopped or killed in the middle of a poll, right after it has sent one of the six
// requests: linuxptp's ptp4l must go on answering others. The host is a child of the test; its
// sendto stands before the C library's own.

#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdint>
#include <filesystem>
#include <ostream>

#include <gtest/gtest.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include "contract/PluginFixture.h"
#include "support/EpochFifo.h"
#include "support/NextFunction.h"
#include "system/ManagementClient.h"
#include "system/Scene.h"

namespace {

struct Moment {
    const char* name;
    std::uint16_t managementId;
    int signal;
};

void PrintTo(const Moment& moment, std::ostream* out) {
    *out << moment.name;
}

/// The request after which the host gets its signal; 0 for none.
std::atomic<std::uint16_t> fatalRequest{0};
std::atomic<int> fatalSignal{0};

std::uint16_t managementIdOf(const void* octets, std::size_t length) {
    const auto* const request = static_cast<const std::uint8_t*>(octets);
    return length < 54 ? std::uint16_t{0}
                       : static_cast<std::uint16_t>(request[52] << 8 | request[53]);
}

} // namespace

extern "C" [[gnu::visibility("default")]] ssize_t sendto(int socket, const void* octets,
                                                         std::size_t length, int flags,
                                                         const sockaddr* address,
                                                         socklen_t addressLength) {
    static const auto next = nextFunction<decltype(sendto)>("sendto");
    const ssize_t sent = next(socket, octets, length, flags, address, addressLength);
    if (fatalRequest != 0 && managementIdOf(octets, length) == fatalRequest) {
        fatalRequest = 0;
        kill(getpid(), fatalSignal);
    }
    return sent;
}

namespace {

/// The host, in a process of its own: follows the grandmaster, then waits for its signal.
[[noreturn]] void runHost(const Moment& moment) {
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    std::filesystem::current_path("/tmp");
    const RecordingHost host;
    const SyslogCapture log;
    const EpochFifo fifo;
    const Plugin plugin;
    void* slot = nullptr;
    HostStatus status;
    plugin.initialize(&slot, sceneConfiguration().c_str(), &status);
    plugin.start(&slot, &status);
    const bool follows = host.waitFor(
        [](const std::vector<RecordingHost::Call>& calls) {
            return !calls.empty() && calls.back().function == RecordingHost::Function::adjustTime;
        },
        std::chrono::seconds(30));
    if (!follows) {
        _exit(1);
    }
    fatalSignal = moment.signal;
    fatalRequest = moment.managementId;
    for (;;) {
        pause();
    }
}

class HostInAPoll : public testing::TestWithParam<Moment> {
protected:
    // ptp4l is the child of the host: it stays when that is killed, for others of this scene.
    void TearDown() override {
        kill(host, SIGKILL);
        waitpid(host, nullptr, 0);
    }

    pid_t host = -1;
};

TEST_P(HostInAPoll, LeavesTheDaemonAnsweringOthersAtOnce) {
    host = fork();
    if (host == 0) {
        runHost(GetParam());
    }
    int state = 0;
    ASSERT_EQ(waitpid(host, &state, WUNTRACED), host);
    const bool killed = GetParam().signal == SIGKILL;
    ASSERT_TRUE(killed ? WIFSIGNALED(state) : WIFSTOPPED(state)) << state;
    const auto start = std::chrono::steady_clock::now();
    const auto answers = askDaemon(sceneSocket(), "DEFAULT_DATA_SET");
    const auto took = std::chrono::steady_clock::now() - start;
    ASSERT_EQ(answers.size(), 1U);
    EXPECT_EQ(answers[0].at("numberPorts"), std::to_string(sceneInterfaces().size()));
    // pmc itself waits 100 ms for more answers.
    EXPECT_LT(took, std::chrono::seconds(1));
}

const Moment moments[] = {
    {"KilledAfterTimeStatusNp", 0xC000, SIGKILL},
    {"KilledAfterPortDataSet", 0x2004, SIGKILL},
    {"KilledAfterPortDataSetNp", 0xC002, SIGKILL},
    {"KilledAfterPortPropertiesNp", 0xC004, SIGKILL},
    {"StoppedAfterTimeStatusNp", 0xC000, SIGSTOP},
    {"StoppedAfterPortDataSet", 0x2004, SIGSTOP},
    {"StoppedAfterPortDataSetNp", 0xC002, SIGSTOP},
    {"StoppedAfterPortPropertiesNp", 0xC004, SIGSTOP},
};

INSTANTIATE_TEST_SUITE_P(Moments, HostInAPoll, testing::ValuesIn(moments),
                         [](const testing::TestParamInfo<Moment>& moment) {
                             return std::string(moment.param.name);
                         });

} // namespace
