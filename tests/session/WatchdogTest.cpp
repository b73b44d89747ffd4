#include <atomic>
#include <chrono>
#include <filesystem>
#include <memory>

#include <gmock/gmock.h>
#include <sys/stat.h>
#include <syslog.h>

#include "Interposed.h"
#include "SessionFixture.h"

namespace {

using testing::IsEmpty;

constexpr char death[] = "PTP sub process has died unexpectedly";
constexpr char refused[] =
    "PTP4l process has died, watchdog unable to set quality to unusable,got error: -1";
constexpr char threw[] =
    "PTP4l process has died, watchdog unable to set quality to unusable,got error: -52003";
constexpr char stopping[] = "KEL is stopping, ignoring the error: -52009";

class WatchdogTest : public SessionTest {
protected:
    Calls deaths() const {
        Calls chosen;
        for (const auto& call : host.calls(Function::setTRQuality)) {
            if (call.text == death) {
                chosen.push_back(call);
            }
        }
        return chosen;
    }

    bool waitForDeaths(std::size_t count) {
        return waitUntil([=] { return deaths().size() >= count; });
    }

    /// Waits for the report, and for the thread that made it to be gone.
    void expectOneReport() {
        ASSERT_TRUE(waitForDeaths(1));
        expectOwnThreads(1);
        ASSERT_EQ(deaths().size(), 1U);
        EXPECT_EQ(deaths()[0].quality, (std::array<double, 3>{-2.0, -2.0, -1.0}));
        EXPECT_FALSE(hasChildren());
        session.stop();
        EXPECT_EQ(deaths().size(), 1U);
        EXPECT_THAT(sentSignals(), IsEmpty());
    }
};

TEST_F(WatchdogTest, ReportsADaemonThatExitsAtOnce) {
    const auto start = std::chrono::steady_clock::now();
    begin("exit-at-once 0\n");
    expectOneReport();
    // A second, and what a busy machine adds.
    EXPECT_LT(deaths()[0].at - start, std::chrono::seconds(3));
}

TEST_F(WatchdogTest, ReportsADaemonThatIsNoProgram) {
    std::filesystem::remove("ptp4l");
    writeFile("ptp4l", "text");
    chmod("ptp4l", 0755);
    begin("");
    expectOneReport();
}

TEST_F(WatchdogTest, ReportsADaemonThatDiesLater) {
    begin("on TIME_STATUS_NP after 2 times 1 do exit 1\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 2));
    expectOneReport();
}

TEST_F(WatchdogTest, SaysNothingWhileTheDaemonRuns) {
    begin("gm present\n");
    // The long sleep of 125 ms: the watchdog has looked twice by then.
    ASSERT_TRUE(waitForCalls(Function::getTime, 20));
    EXPECT_THAT(deaths(), IsEmpty());
    expectOwnThreads(2);
}

TEST_F(WatchdogTest, SleepsASecondBeforeEachLook) {
    const int before = sleepsOfWatchdog().count;
    begin("gm present\n");
    ASSERT_TRUE(waitUntil([=] { return sleepsOfWatchdog().count >= before + 2; }));
    EXPECT_EQ(sleepsOfWatchdog().shortest, std::chrono::seconds(1));
    EXPECT_EQ(sleepsOfWatchdog().longest, std::chrono::seconds(1));
}

TEST_F(WatchdogTest, ReportsFromAThreadOfItsOwn) {
    begin("on TIME_STATUS_NP after 2 times 1 do exit 1\n");
    ASSERT_TRUE(waitForDeaths(1));
    EXPECT_NE(deaths()[0].thread, std::this_thread::get_id());
    EXPECT_NE(deaths()[0].thread, host.calls(Function::getTime).at(0).thread);
}

TEST_F(WatchdogTest, WorkerGoesOnAfterADeath) {
    begin("exit-at-once 0\n");
    ASSERT_TRUE(waitForDeaths(1));
    const std::size_t before = host.calls(Function::updateMetaData).size();
    EXPECT_TRUE(waitForCalls(Function::updateMetaData, before + 3));
}

TEST_F(WatchdogTest, RetriesEachSecondUntilTheHostAccepts) {
    const auto next = std::make_shared<std::atomic<int>>(0);
    host.onCall([=](const RecordingHost::Call& call, zeerr_Status& status) {
        if (call.text == death) {
            switch ((*next)++) {
            case 0:
                status.code = -52009;
                break;
            case 1:
                status.code = -1;
                break;
            case 2:
                throw 42;
            default:
                break;
            }
        }
    });
    begin("exit-at-once 0\n");
    ASSERT_TRUE(waitForDeaths(4));
    expectOwnThreads(1);
    const auto reports = deaths();
    ASSERT_EQ(reports.size(), 4U);
    for (std::size_t report = 1; report < 4; ++report) {
        EXPECT_GE(reports[report].at - reports[report - 1].at, std::chrono::milliseconds(1000));
    }
    const auto isOfTheWatchdog = [](const SyslogCapture::Line& line) {
        return line.text.find("update Meta Data") != 0 &&
               line.text.find("Unable to communicate") != 0;
    };
    std::vector<SyslogCapture::Line> lines;
    for (const auto& line : log.lines()) {
        if (isOfTheWatchdog(line)) {
            lines.push_back(line);
        }
    }
    EXPECT_THAT(lines, testing::ElementsAre(SyslogCapture::Line{LOG_INFO, stopping},
                                            SyslogCapture::Line{LOG_ERR, refused},
                                            SyslogCapture::Line{LOG_ERR, threw}));
}

TEST_F(WatchdogTest, CallsTheHostAtTheSameTimeAsTheWorker) {
    // Each of the two waits in the host until the other is there, too.
    struct Meeting {
        std::atomic<bool> watchdogIsIn{false};
        std::atomic<bool> workerIsIn{false};
        std::atomic<bool> met{false};
    };
    const auto meeting = std::make_shared<Meeting>();
    host.onCall([=](const RecordingHost::Call& call, zeerr_Status&) {
        if (call.text == death) {
            meeting->watchdogIsIn = true;
            meeting->met = waitUntil([&] { return meeting->workerIsIn.load(); });
        } else if (meeting->watchdogIsIn) {
            meeting->workerIsIn = true;
        }
    });
    begin("exit-at-once 0\n");
    ASSERT_TRUE(waitForDeaths(1));
    EXPECT_TRUE(waitUntil([&] { return meeting->met.load(); }));
}

} // namespace
