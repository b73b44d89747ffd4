// A host whose functions fail, throw or block.

#include <atomic>
#include <chrono>
#include <cstring>
#include <functional>
#include <memory>
#include <new>
#include <ostream>
#include <stdexcept>
#include <string>
#include <thread>

#include <gmock/gmock.h>
#include <syslog.h>

#include "FaultTest.h"
#include "Interposed.h"

namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;
using testing::Contains;
using testing::ElementsAreArray;
using Function = RecordingHost::Function;

const std::string unableToCall = "Unable to call into KEL in vantel, got error: ";

void setText(zeerr_Status& status, const char* text) {
    ASSERT_TRUE(status.resize(&status, 64));
    std::strcpy(status.json, text);
}

/// What a host does wrong, and what the log then says.
struct Misdeed {
    const char* name;
    RecordingHost::Reaction reaction;
    SyslogCapture::Line line;
};

void PrintTo(const Misdeed& misdeed, std::ostream* out) {
    *out << misdeed.name;
}

const Misdeed misdeeds[] = {
    {"Stopping",
     [](const RecordingHost::Call&, zeerr_Status& status) { status.code = -52009; },
     {LOG_INFO, "KEL is stopping, ignoring the error: -52009"}},
    {"StoppingWithText",
     [](const RecordingHost::Call&, zeerr_Status& status) {
         status.code = -52009;
         setText(status, R"({"host":"going down"})");
     },
     {LOG_INFO, "KEL is stopping, ignoring the error: -52009"}},
    {"OtherCode",
     [](const RecordingHost::Call&, zeerr_Status& status) { status.code = -1; },
     {LOG_ERR, unableToCall + "-1"}},
    {"OtherCodeWithText",
     [](const RecordingHost::Call&, zeerr_Status& status) {
         status.code = INT32_MIN;
         setText(status, "no JSON at all");
     },
     {LOG_ERR, unableToCall + "-2147483648"}},
    {"StandardException",
     [](const RecordingHost::Call&, zeerr_Status&) { throw std::runtime_error("no"); },
     {LOG_ERR, unableToCall + "-52003"}},
    {"OtherException",
     [](const RecordingHost::Call&, zeerr_Status&) { throw 42; },
     {LOG_ERR, unableToCall + "-52003"}},
    {"NoMemory",
     [](const RecordingHost::Call&, zeerr_Status&) { throw std::bad_alloc(); },
     {LOG_ERR, unableToCall + "-52000"}},
};

constexpr Function gt = Function::getTime;
constexpr Function sq = Function::setTRQuality;
constexpr Function at = Function::adjustTime;
constexpr Function um = Function::updateMetaData;

class HostCallTest : public FaultTest {
protected:
    std::vector<Function> functions() const {
        std::vector<Function> called;
        for (const auto& call : host.calls()) {
            called.push_back(call.function);
        }
        return called;
    }
};

class HostFailureTest : public HostCallTest, public testing::WithParamInterface<Misdeed> {
protected:
    /// Lets each function fail once, in the order in which a poll calls them.
    void failEachOnce() {
        const auto next = std::make_shared<std::atomic<std::size_t>>(0);
        const auto starter = std::this_thread::get_id();
        host.onCall([=](const RecordingHost::Call& call, zeerr_Status& status) {
            static constexpr Function order[] = {gt, sq, at, um};
            const std::size_t failing = *next;
            if (call.thread != starter && failing < std::size(order) &&
                call.function == order[failing]) {
                ++*next;
                GetParam().reaction(call, status);
            }
        });
    }
};

// What failed is reported again in the next poll: role, measurement and metadata are still news.
TEST_P(HostFailureTest, EndsThePollAndIsForgotten) {
    failEachOnce();
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(um, 3));
    // Start, four polls that fail at one function after the other, and a good one.
    const std::vector<Function> expected = {um, sq, gt, gt, sq, gt, sq, at,
                                            gt, sq, at, um, gt, sq, at, um};
    auto called = functions();
    called.resize(expected.size());
    EXPECT_THAT(called, ElementsAreArray(expected));

    host.onCall(GetParam().reaction);
    ASSERT_TRUE(waitForLog(GetParam().line.text, 5));
    for (const auto& line : log.lines()) {
        if (line.text.rfind("update Meta Data: ", 0) != 0) {
            EXPECT_EQ(line, GetParam().line);
        }
    }
    expectStopWithin({});
}

INSTANTIATE_TEST_SUITE_P(Kinds, HostFailureTest, testing::ValuesIn(misdeeds),
                         [](const auto& testInfo) { return testInfo.param.name; });

/// Each of them for as long as ptp4l's death is to be reported.
class WatchdogFailureTest : public HostCallTest, public testing::WithParamInterface<Misdeed> {};

TEST_P(WatchdogFailureTest, IsRetriedEachSecondUntilStop) {
    host.onCall([death = died.reason](const RecordingHost::Call& call, zeerr_Status& status) {
        if (call.text == death) {
            GetParam().reaction(call, status);
        }
    });
    begin("exit-at-once 0\n");
    auto line = GetParam().line;
    if (line.priority == LOG_ERR) {
        line.text.replace(0, unableToCall.size(),
                          "PTP4l process has died, watchdog unable to set quality to "
                          "unusable,got error: ");
    }
    ASSERT_TRUE(waitForLog(line.text));
    EXPECT_THAT(log.lines(), Contains(line));
    EXPECT_THAT(qualities(), Contains(died));
    expectOwnThreads(2);
    expectStopWithin({});
    EXPECT_THAT(sentSignals(), testing::IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Kinds, WatchdogFailureTest,
                         testing::Values(misdeeds[0], misdeeds[2], misdeeds[5]),
                         [](const auto& testInfo) { return testInfo.param.name; });

TEST_F(HostCallTest, WarningIsNoError) {
    host.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = 52009; });
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(gt, 3));
    EXPECT_EQ(qualities().size(), 2U);
    EXPECT_EQ(host.calls(at).size(), 1U);
    EXPECT_EQ(metaData().size(), 2U);
    EXPECT_EQ(log.lines().size(), 2U);
    expectStopWithin({});
}

/// A host that holds calls up, in a poll that brings them all.
class HostBlocksTest : public HostCallTest {
protected:
    /// Holds up what is chosen, in the session's threads, and stops in the middle of the first.
    void stopWhileBlocked(const std::function<bool(const RecordingHost::Call&)>& isChosen,
                          const std::string& script, milliseconds each, milliseconds bound) {
        const auto entered = std::make_shared<std::atomic<bool>>(false);
        const auto starter = std::this_thread::get_id();
        host.onCall([=](const RecordingHost::Call& call, zeerr_Status&) {
            if (call.thread != starter && isChosen(call)) {
                *entered = true;
                std::this_thread::sleep_for(each);
            }
        });
        begin(script);
        ASSERT_TRUE(waitUntil([&] { return entered->load(); }));
        expectStopWithin({0, true, bound});
    }
};

class HostFunctionBlocksTest : public HostBlocksTest,
                               public testing::WithParamInterface<Function> {};

TEST_P(HostFunctionBlocksTest, ForThreeSeconds) {
    stopWhileBlocked([](const auto& call) { return call.function == GetParam(); },
                     "clock fixed 1000\n", seconds(3), seconds(3));
    EXPECT_THAT(functions(), testing::ElementsAre(um, sq, gt, sq, at, um));
    EXPECT_THAT(qualities(), testing::ElementsAre(waiting, usable));
}

std::string nameOf(const testing::TestParamInfo<Function>& function) {
    constexpr const char* names[] = {"GetTime", "AdjustTime", "SetTRQuality", "UpdateMetaData"};
    return names[static_cast<int>(function.param)];
}

INSTANTIATE_TEST_SUITE_P(Functions, HostFunctionBlocksTest, testing::Values(gt, sq, at, um),
                         nameOf);

// A poll that has begun to report ends with its last call.
TEST_F(HostBlocksTest, InEveryCallOfAPoll) {
    stopWhileBlocked([](const auto&) { return true; }, "clock fixed 1000\n", seconds(1),
                     seconds(4));
    EXPECT_THAT(functions(), testing::ElementsAre(um, sq, gt, sq, at, um));
}

TEST_F(HostBlocksTest, InTheWatchdogsCall) {
    stopWhileBlocked([death = died.reason](const auto& call) { return call.text == death; },
                     "exit-at-once 0\n", seconds(3), seconds(3));
    EXPECT_THAT(qualities(), Contains(died));
}

} // namespace
