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
#include "support/Markdown.h"

namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;
using std::chrono::steady_clock;

/// For a busy machine. Less than what one more answer takes.
constexpr milliseconds slack{1500};

/// What a stop may take beyond its bound before it counts as one that never returns.
constexpr seconds patience{20};

const std::string unableToCommunicate =
    "Unable to communicate with PTP sub process while attempting to retrieve data,got error: ";

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

/// "Suite.Behaviour", without the names of an instantiation and of its parameter.
std::string nameOfThisTest() {
    const auto& test = *testing::UnitTest::GetInstance()->current_test_info();
    const std::string suite = test.test_suite_name();
    const std::string name = test.name();
    return suite.substr(suite.find('/') + 1) + '.' + name.substr(0, name.find('/'));
}

/// What the row of this test in docs/testing.md promises.
std::string boundInTheTable() {
    static const auto rows =
        markdown::tables(readFile(VANTEL_PROJECT_FOLDER "/docs/testing.md"),
                         {"fault", "the host sees", "stop takes at most", "test"});
    for (const auto& row : rows) {
        if (markdown::unquoted(row.at(3)) == nameOfThisTest()) {
            return row.at(2);
        }
    }
    return "no row";
}

void print(milliseconds took, milliseconds bound, milliseconds late) {
    std::printf("[ STOP ] %s: %.3f s of at most %.1f s + %.1f s late\n", nameOfThisTest().c_str(),
                inSeconds(took), inSeconds(bound), inSeconds(late));
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
    return seconds(2) * answers + second() + hostCall + seconds(grace ? 10 : 0);
}

milliseconds FaultTest::UnderWay::atOnce() const {
    return std::max<milliseconds>(seconds(2) * answers + hostCall, second()) +
           seconds(grace ? 10 : 0);
}

milliseconds FaultTest::UnderWay::second() const {
    return seconds(watchdog ? 1 : 0);
}

FaultTest::FaultTest() : promised_(boundInTheTable()) {}

void FaultTest::TearDown() {
    EXPECT_TRUE(hasMeasured_ || IsSkipped()) << "no stop was measured";
}

std::string FaultTest::failureLine(int code) {
    return unableToCommunicate + std::to_string(code);
}

int FaultTest::endedPolls() const {
    int ended = static_cast<int>(host.calls(Function::getTime).size());
    for (const auto& line : log.lines()) {
        ended += line.text.rfind(unableToCommunicate, 0) == 0 ? 1 : 0;
    }
    return ended;
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
    expectStopWithin(underWay, [this] { session.stop(); });
}

void FaultTest::expectStopWithin(const UnderWay& underWay, const std::function<void()>& stop) {
    const milliseconds bound = underWay.sum();
    EXPECT_EQ(promised_, std::to_string(std::chrono::duration_cast<seconds>(bound).count()) + " s");
    const Deadline deadline(std::chrono::duration_cast<seconds>(bound) + patience);
    const auto oversleptBefore = overslept();
    int sleeps = 0;
    int polls = 0;
    do { // until no poll begins while polls are counted
        sleeps = sleepsOfWorker().count;
        polls = endedPolls();
    } while (sleeps != sleepsOfWorker().count);
    const auto begun = steady_clock::now();
    stop();
    const auto took = std::chrono::duration_cast<milliseconds>(steady_clock::now() - begun);
    // The period of grace is a thousand short sleeps, each of which may be late.
    const auto late = std::chrono::duration_cast<milliseconds>(overslept() - oversleptBefore);
    print(took, bound, late);
    hasMeasured_ = true;
    EXPECT_LE(took.count(), (underWay.atOnce() + late + slack).count()) << "milliseconds";
    // One that was under way at the count may have ended before the stop.
    const int underWayAtCount = sleeps == polls ? 1 : 0;
    EXPECT_LE(endedPolls() - polls, 1 + underWayAtCount) << "polls went on";
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
