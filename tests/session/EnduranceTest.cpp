#include <atomic>
#include <cstdlib>
#include <memory>
#include <new>
#include <stdexcept>

#include <gmock/gmock.h>
#include <malloc.h>

#include "Interposed.h"
#include "SessionFixture.h"
#include "support/Descriptors.h"

namespace {

/// A number from the environment, for longer runs than every developer wants.
int fromEnvironment(const char* name, int otherwise) {
    const char* const text = std::getenv(name);
    return text == nullptr ? otherwise : std::atoi(text);
}

/// Octets allocated. 0 where a sanitizer has its own allocator, and its own look for leaks.
std::size_t allocated() {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    return 0;
#else
    const auto info = mallinfo2();
    return info.uordblks + info.hblkhd;
#endif
}

/// What a process holds.
struct Holdings {
    int descriptors = openDescriptors();
    int threads = settledThreadCount();
    std::size_t memory = allocated();
};

/// The caches of the allocator may differ by some thousand octets; a cycle may not keep as much as
/// one small object.
void expectConstant(const Holdings& before, int cycles) {
    const Holdings after;
    EXPECT_EQ(after.descriptors, before.descriptors);
    EXPECT_EQ(after.threads, before.threads);
    EXPECT_LT(after.memory, before.memory + 8 * static_cast<std::size_t>(cycles) + 12288);
    EXPECT_FALSE(hasChildren());
}

/// A fixture without a host and a log of its own, since they grow: there is a new one each cycle.
class EnduranceTest : public testing::Test {
protected:
    static void runSession() {
        const FormerThreads threads;
        forgetSentSignals();
        const SyslogCapture log;
        const RecordingHost host;
        Session session;
        session.initialise(sessionConfiguration(R"(["eth0"])"));
        session.start();
        EXPECT_TRUE(host.waitFor([](const std::vector<RecordingHost::Call>& calls) {
            return calls.back().text.find("Port1") != std::string::npos;
        }));
    }

    static void initialiseAndFinalise(int cycles) {
        for (int cycle = 0; cycle < cycles; ++cycle) {
            Session session;
            session.initialise(sessionConfiguration(R"(["eth0"])"));
        }
    }

    const TemporaryFolder folder;
    const SimulatedDaemon daemon{simulatorProgram};
    const EpochFifo fifo;
};

TEST_F(EnduranceTest, CyclesOfAWholeSessionHoldNothing) {
    const int cycles = fromEnvironment("VANTEL_CYCLES", 20);
    SimulatedDaemon::script("gm present\n");
    for (int warmUp = 0; warmUp < 5; ++warmUp) {
        runSession();
    }
    const Holdings before;
    for (int cycle = 0; cycle < cycles && !HasFailure(); ++cycle) {
        runSession();
    }
    expectConstant(before, cycles);
}

TEST_F(EnduranceTest, TenThousandCyclesOfInitialiseAndFinaliseHoldNothing) {
    initialiseAndFinalise(100);
    const Holdings before;
    initialiseAndFinalise(10000);
    expectConstant(before, 10000);
}

/// Fails one call in three, in each of the ways there are. Without a lock: the sanitizers are to
/// see what the plug-in itself orders.
class RandomMisdeeds {
public:
    void operator()(zeerr_Status& status) {
        switch (next() % 18) {
        case 0:
            status.code = -52009;
            break;
        case 1:
            status.code = -1;
            status.resize(&status, 64);
            break;
        case 2:
            throw std::runtime_error("no");
        case 3:
            throw 42;
        case 4:
            throw std::bad_alloc();
        case 5:
            status.code = 1;
            break;
        default:
            break;
        }
    }

private:
    unsigned next() { return (state_.fetch_add(0x9E3779B9U) * 2654435761U) >> 16; }

    std::atomic<unsigned> state_{1};
};

class RandomErrorsTest : public SessionTest {
protected:
    const std::chrono::seconds duration{fromEnvironment("VANTEL_SECONDS", 3)};

    /// Runs a session for some time with a host that fails at random, once it has started.
    void run(const std::string& script) {
        begin(script, R"(["eth0","eth1"])");
        const auto misdeeds = std::make_shared<RandomMisdeeds>();
        host.setTime(1700000000112000000);
        host.onCall([=](const RecordingHost::Call&, zeerr_Status& status) { (*misdeeds)(status); });
        const auto end = std::chrono::steady_clock::now() + duration;
        host.waitFor([=](const Calls&) { return std::chrono::steady_clock::now() >= end; },
                     duration + std::chrono::seconds(1));
        session.stop();
        EXPECT_FALSE(hasChildren());
        expectOwnThreads(0);
    }
};

TEST_F(RandomErrorsTest, OfTheHostWhileTheDaemonComesAndGoes) {
    run("clock fixed 1700000000000000000\n"
        "sync-interval 0.05\n"
        "on TIME_STATUS_NP after 5 times 1 do gm off\n"
        "on TIME_STATUS_NP after 10 times 1 do gm on\n"
        "on PORT_DATA_SET after 7 times 3 do length -1\n"
        "on PARENT_DATA_SET after 20 times 3 do duplicate\n");
    EXPECT_GT(host.calls(Function::getTime).size(), 5U);
}

TEST_F(RandomErrorsTest, OfTheHostWhileTheDaemonDies) {
    run("clock fixed 1700000000000000000\n"
        "at 0.5 do exit 0\n");
    EXPECT_GT(host.calls(Function::setTRQuality).size(), 3U);
}

} // namespace
