// A host without memory. A program of its own: operator new is the one below, which can be told to
// fail.

#include <atomic>
#include <csignal>
#include <cstddef>
#include <cstdlib>
#include <memory>
#include <new>

#include <cjson/cJSON.h>
#include <gmock/gmock.h>
#include <syslog.h>
#include <unistd.h>

#include "FaultTest.h"
#include "support/OwnAllocations.h"

namespace {

constexpr int unlimited = -1;

std::atomic<int> allowance{unlimited}; ///< allocations that still succeed
std::atomic<bool> isForGood{false};
std::atomic<int> refusals{0};
std::atomic<int> refusedTexts{0}; ///< of refusals, those that leave a status without its text
std::atomic<int> living{0};       ///< blocks of the plug-in

/// Whether the first thread, which is that of the tests, is in a call of the plug-in. Its
/// allocations are refused then, and otherwise those of the session's threads.
std::atomic<bool> isHostInThePlugin{false};

bool isHost() {
    return gettid() == getpid();
}

bool isThePlugins() {
    return !OwnAllocations::areMade() && (!isHost() || isHostInThePlugin);
}

bool isRefused() {
    if (isHost() != isHostInThePlugin) {
        return false;
    }
    int left = allowance;
    while (left != unlimited &&
           !allowance.compare_exchange_weak(left, left == 0 && isForGood ? 0 : left - 1)) {
    }
    refusals += left == 0 ? 1 : 0;
    return left == 0;
}

/// Before each block, aligned for all that may stand in it.
union Head {
    bool isThePlugins;
    std::max_align_t alignment;
};

void* allocate(std::size_t size) {
    const bool plugins = isThePlugins();
    if (plugins && isRefused()) {
        return nullptr;
    }
    auto* const head = static_cast<Head*>(std::malloc(sizeof(Head) + size));
    if (head == nullptr) {
        return nullptr;
    }
    head->isThePlugins = plugins;
    living += plugins ? 1 : 0;
    return head + 1;
}

void* allocateOrThrow(std::size_t size) {
    void* const memory = allocate(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

void release(void* memory) {
    if (memory != nullptr) {
        Head* const head = static_cast<Head*>(memory) - 1;
        living -= head->isThePlugins ? 1 : 0;
        std::free(head);
    }
}

/// Lets cJSON, which uses malloc, take its memory here while this object lives.
class CjsonAllocations {
public:
    CjsonAllocations() {
        cJSON_Hooks hooks{[](std::size_t size) {
                              void* const memory = allocate(size);
                              wasRefused_ = memory == nullptr;
                              return memory;
                          },
                          release};
        cJSON_InitHooks(&hooks);
    }
    ~CjsonAllocations() { cJSON_InitHooks(nullptr); }
    CjsonAllocations(const CjsonAllocations&) = delete;
    CjsonAllocations& operator=(const CjsonAllocations&) = delete;

    /// Whether the last one of them was.
    static bool wasRefused() { return wasRefused_; }

private:
    static inline bool wasRefused_ = false;
};

} // namespace

void* operator new(std::size_t size) {
    return allocateOrThrow(size);
}

void* operator new[](std::size_t size) {
    return allocateOrThrow(size);
}

void* operator new(std::size_t size, const std::nothrow_t& /*tag*/) noexcept {
    return allocate(size);
}

void* operator new[](std::size_t size, const std::nothrow_t& /*tag*/) noexcept {
    void* const memory = allocate(size);
    refusedTexts += memory == nullptr ? 1 : 0;
    return memory;
}

void operator delete(void* memory) noexcept {
    release(memory);
}

void operator delete[](void* memory) noexcept {
    release(memory);
}

void operator delete(void* memory, std::size_t /*size*/) noexcept {
    release(memory);
}

void operator delete[](void* memory, std::size_t /*size*/) noexcept {
    release(memory);
}

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsSupersetOf;
using testing::SizeIs;
using testing::Value;

constexpr char noMemory[] = "Unable to call into KEL in vantel, got error: -52000";

class MemoryFaultTest : public FaultTest {
protected:
    ~MemoryFaultTest() override { allowance = unlimited; }

    /// Lets one allocation of the plug-in fail, or all from then on.
    static void refuse(int after, bool forGood = false) {
        refusals = 0;
        isForGood = forGood;
        allowance = after;
    }

    /// Calls the plug-in from this thread with a single allocation that fails.
    /// @return whether it was reached.
    template <typename Call>
    static bool callWithout(int allocation, Call call) {
        refuse(allocation);
        isHostInThePlugin = true;
        call();
        isHostInThePlugin = false;
        allowance = unlimited;
        return refusals > 0;
    }

    /// A daemon that has news of every kind in each poll, and a host that polls it fast.
    void beginWithNews() {
        // So far from 0 in microseconds that 32 bits do not show it: without a grandmaster, the
        // ingress time is 0.
        std::string script = "clock fixed 1696512081920000000\n";
        host.setTime(1696512081920000000 + 120000000);
        for (int poll = 0; poll < 500; ++poll) {
            script += "on TIME_STATUS_NP after " + std::to_string(poll) + " times 1 do gm " +
                      (poll % 2 == 0 ? "on\n" : "off\n");
        }
        begin(script, R"(["eth0"])");
    }
};

TEST_F(MemoryFaultTest, InInitialiseIsReportedAndLeavesNothing) {
    const Plugin plugin;
    const CjsonAllocations cjson;
    const std::string configuration = sessionConfiguration(R"(["eth0","eth1"])");
    int refusedToCjson = 0;
    const int before = living;
    int allocation = 0;
    void** const slot = session.slot();
    for (HostStatus status;
         callWithout(allocation, [&] { plugin.initialize(slot, configuration.c_str(), &status); });
         ++allocation) {
        refusedToCjson += CjsonAllocations::wasRefused() ? 1 : 0;
        EXPECT_EQ(status.code, CjsonAllocations::wasRefused() ? -52005 : -52000) << allocation;
        EXPECT_EQ(*slot, nullptr) << allocation;
        EXPECT_EQ(living, before) << allocation;
        status.code = 0;
        status.resize(&status, 0);
    }
    ASSERT_NE(*slot, nullptr);
    EXPECT_GT(refusedToCjson, 10);
    EXPECT_GT(allocation, refusedToCjson + 10);
    expectStopWithin({0, false});
    EXPECT_EQ(living, before);
    EXPECT_THAT(log.lines(), SizeIs(0));
}

TEST_F(MemoryFaultTest, InStartIsReportedAndLeavesNothingRunning) {
    const int before = living;
    SimulatedDaemon::script("clock fixed 1000\n");
    session.initialise();
    int allocation = 0;
    for (HostStatus status; callWithout(allocation, [&] { session.start(status); }); ++allocation) {
        EXPECT_EQ(status.code, -52000) << allocation;
        EXPECT_FALSE(hasChildren()) << allocation;
        expectOwnThreads(0);
        status.code = 0;
        status.resize(&status, 0);
    }
    EXPECT_GT(allocation, 5);
    ASSERT_TRUE(waitForCalls(Function::adjustTime, 1));
    expectStopWithin({});
    EXPECT_EQ(living, before);
}

// The plan goes on from poll to poll, in the worker: the next allocation is refused when the one
// before was, and it ends when there was none left to refuse. What is refused to the text of a
// status costs the text alone.
TEST_F(MemoryFaultTest, InAnyPlaceOfAPollFailsThatPoll) {
    const int before = living;
    const auto next = std::make_shared<std::atomic<int>>(-1);
    const auto done = std::make_shared<std::atomic<bool>>(false);
    refusedTexts = 0;
    onEachPoll([=](int) {
        if (*next >= 0 && refusals == 0) {
            *done = true;
        }
        if (*done) {
            allowance = unlimited;
        } else {
            refuse(++*next);
        }
    });
    beginWithNews();
    ASSERT_TRUE(waitUntil([&] { return done->load(); }, std::chrono::seconds(50)));
    const int failures = log.count(noMemory) + log.count(failureLine(-52000));
    EXPECT_EQ(failures + refusedTexts, *next);
    EXPECT_GT(log.count(noMemory), 0);
    EXPECT_GT(log.count(failureLine(-52000)), 0);
    EXPECT_THAT(log.lines(), Contains(SyslogCapture::Line{LOG_ERR, noMemory}));
    EXPECT_THAT(log.lines(), Contains(SyslogCapture::Line{LOG_INFO, failureLine(-52000)}));
    EXPECT_THAT(qualities(), Contains(unreachable));
    const std::size_t pairs = host.calls(Function::adjustTime).size();
    EXPECT_TRUE(waitForCalls(Function::adjustTime, pairs + 2));
    expectStopWithin({});
    EXPECT_EQ(living, before);
}

// Ports need memory, and so do the metadata of a poll that failed. Qualities and the watchdog need
// none.
TEST_F(MemoryFaultTest, ForGoodFailsEveryPollUntilTheDaemonDies) {
    begin("clock fixed 1000\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    const pid_t child = daemonPid();
    refuse(0, true);
    ASSERT_TRUE(waitForLog(noMemory, 3));
    EXPECT_THAT(log.lines(), Contains(SyslogCapture::Line{LOG_ERR, noMemory}));
    EXPECT_THAT(log.lines(), Contains(SyslogCapture::Line{LOG_INFO, failureLine(-52000)}));
    EXPECT_THAT(qualities(), IsSupersetOf({waiting, usable, unreachable}));
    ASSERT_EQ(kill(child, SIGKILL), 0);
    EXPECT_TRUE(waitUntil([this] { return Value(qualities(), Contains(died)); }));
    EXPECT_THAT(metaData(), SizeIs(2));
    expectStopWithin({});
}

TEST_F(MemoryFaultTest, ThatComesBackLetsPollsGoOn) {
    begin("clock fixed 1000\n", R"(["eth0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    refuse(0, true);
    ASSERT_TRUE(waitForLog(noMemory, 2));
    const std::size_t polls = host.calls(Function::getTime).size();
    allowance = unlimited;
    EXPECT_TRUE(waitForCalls(Function::getTime, polls + 2));
    EXPECT_EQ(qualities().back(), unreachable);
    expectStopWithin({});
}

TEST_F(MemoryFaultTest, APollWithoutPortsNeedsNone) {
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    refuse(0, true);
    const std::size_t polls = host.calls(Function::getTime).size();
    EXPECT_TRUE(waitForCalls(Function::getTime, polls + 3));
    EXPECT_THAT(qualities(), ElementsAre(waiting, usable));
    expectStopWithin({});
}

TEST_F(MemoryFaultTest, StopAndFinaliseNeedNone) {
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    expectStopWithin({}, [this] {
        EXPECT_FALSE(callWithout(0, [this] {
            session.stop();
            session.finalise();
        }));
    });
    EXPECT_FALSE(hasChildren());
}

} // namespace
