#include "FaultTest.h"

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <string>

#include <sys/wait.h>
#include <unistd.h>

#include "Interposed.h"
#include "InterposedWaits.h"

namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;
using std::chrono::steady_clock;

/// For a busy machine. Less than what one more answer takes.
constexpr milliseconds slack{1500};

/// What a stop may take beyond its bound before it counts as one that never returns.
constexpr seconds patience{20};

void giveUp(int /*signal*/) {
    constexpr char message[] = "stop does not return: giving up\n";
    const ssize_t written = write(STDERR_FILENO, message, sizeof(message) - 1);
    _exit(written < 0 ? 2 : 1);
}

/// Ends the program unless this object goes in time.
class Deadline {
public:
    explicit Deadline(seconds time) : previous_(std::signal(SIGALRM, giveUp)) {
        alarm(static_cast<unsigned>(time.count()));
    }
    ~Deadline() {
        alarm(0);
        std::signal(SIGALRM, previous_);
    }
    Deadline(const Deadline&) = delete;
    Deadline& operator=(const Deadline&) = delete;

private:
    sighandler_t previous_;
};

double inSeconds(milliseconds time) {
    return std::chrono::duration<double>(time).count();
}

void print(milliseconds took, milliseconds bound) {
    const auto& test = *testing::UnitTest::GetInstance()->current_test_info();
    std::printf("[ STOP ] %s.%s: %.3f s of at most %.1f s\n", test.test_suite_name(), test.name(),
                inSeconds(took), inSeconds(bound));
    std::fflush(stdout);
}

template <typename Element>
std::vector<Element> behind(std::vector<Element> elements, std::size_t count) {
    elements.erase(elements.begin(), elements.begin() + static_cast<std::ptrdiff_t>(count));
    return elements;
}

bool hasEnded(pid_t child) {
    return waitpid(child, nullptr, WNOHANG) != 0;
}

} // namespace

milliseconds FaultTest::UnderWay::sum() const {
    return seconds(2) * answers + seconds(watchdog ? 1 : 0) + hostCall + seconds(grace ? 10 : 0);
}

std::string FaultTest::failureLine(int code) {
    return "Unable to communicate with PTP sub process while attempting to retrieve data,"
           "got error: " +
           std::to_string(code);
}

void FaultTest::beginWell(const std::string& script, const std::string& interfaces) {
    begin(script, interfaces);
    waitForFirstGoodPoll();
}

void FaultTest::waitForFirstGoodPoll() {
    const auto isOfAGoodPoll = [](const RecordingHost::Call& call) {
        return call.function == Function::updateMetaData && call.text != defaultMetaData;
    };
    ASSERT_TRUE(host.waitFor([=](const Calls& calls) {
        return std::any_of(calls.begin(), calls.end(), isOfAGoodPoll);
    }));
    for (const auto& call : host.calls()) {
        qualitiesBefore_ += call.function == Function::setTRQuality ? 1 : 0;
        metaDataBefore_ += call.function == Function::updateMetaData ? 1 : 0;
        if (isOfAGoodPoll(call)) {
            break;
        }
    }
    EXPECT_EQ(qualities().at(0), waiting);
    EXPECT_EQ(qualities().at(qualitiesBefore_ - 1), usable);
}

std::vector<QualityReport> FaultTest::newQualities() const {
    return behind(qualities(), qualitiesBefore_);
}

std::vector<std::string> FaultTest::newMetaData() const {
    return behind(metaData(), metaDataBefore_);
}

void FaultTest::expectFailure(int code) {
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, metaDataBefore_ + 1));
    EXPECT_EQ(newQualities().at(0), unreachable);
    EXPECT_EQ(newMetaData().at(0), defaultMetaData);
    EXPECT_GE(log.count(failureLine(code)), 1);
}

void FaultTest::expectSilentRecovery() {
    const std::size_t polls = host.calls(Function::getTime).size();
    ASSERT_TRUE(waitForCalls(Function::getTime, polls + 2));
    EXPECT_EQ(qualities().back(), unreachable);
}

pid_t FaultTest::daemonPid() {
    EXPECT_TRUE(SimulatedDaemon::waitFor("start"));
    return SimulatedDaemon::events("start").at(0).pid;
}

bool FaultTest::waitUntilAnswerIsAwaited() {
    const int before = answersAwaited();
    return waitUntil([=] { return answersAwaited() > before; });
}

bool FaultTest::waitUntilRequestIsSent() {
    const int before = requestsSent();
    return waitUntil([=] { return requestsSent() > before; });
}

void FaultTest::expectStopWithin(const UnderWay& underWay) {
    const milliseconds bound = underWay.sum();
    const Deadline deadline(std::chrono::duration_cast<seconds>(bound) + patience);
    const auto begun = steady_clock::now();
    const auto oversleptBefore = overslept();
    session.stop();
    const auto took = std::chrono::duration_cast<milliseconds>(steady_clock::now() - begun);
    print(took, bound);
    // The period of grace is a thousand short sleeps, each of which may be late.
    const auto late = std::chrono::duration_cast<milliseconds>(overslept() - oversleptBefore);
    EXPECT_LE(took.count(), (bound + slack + late).count()) << "milliseconds";
    expectNothingLeft(underWay.grace);
    session.finalise();
}

void FaultTest::expectNothingLeft(bool killed) const {
    expectOwnThreads(helpers.threads);
    for (const pid_t child : children()) {
        const auto& ours = helpers.processes;
        if (std::find(ours.begin(), ours.end(), child) == ours.end()) {
            // One that was killed is not waited for; that is the host's.
            EXPECT_TRUE(killed && waitUntil([=] { return hasEnded(child); })) << "left: " << child;
        }
    }
}
