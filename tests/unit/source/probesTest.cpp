#include "probes.h"

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <mutex>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "errors/Trace.h"
#include "paths.h"
#include "support/FakePtp4l.h"
#include "support/RecordingHost.h"
#include "support/TemporaryFolder.h"
#include "tHost.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lTimeRef.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tSharedFifo.h"
#include "tUdsMsgInterface.h"
#include "unit/source/ProtocolConfigFixture.h"

using namespace zekelVantel;

namespace {

using Messages = std::vector<std::string>;

constexpr char prefix[] = "[ vantel_bc|                          probes|] ";

std::mutex mutex;
std::condition_variable changed;
Messages traced;

void take(const char* line) {
    const std::lock_guard<std::mutex> lock(mutex);
    traced.emplace_back(line);
    changed.notify_all();
}

/// The trace lines, at first at the default threshold. Their prefix has no line number here.
class Traces {
public:
    Traces() {
        traced.clear();
        zesdbg::settings.lineWidth = 0;
        zesdbg::settings.output = &take;
    }
    ~Traces() { zesdbg::settings = defaults_; }
    Traces(const Traces&) = delete;
    Traces& operator=(const Traces&) = delete;

    /// What was traced, without the prefix and the line feed.
    static Messages messages() {
        const std::lock_guard<std::mutex> lock(mutex);
        Messages messages;
        for (const std::string& line : traced) {
            EXPECT_EQ(line.rfind(prefix, 0), 0U) << line;
            EXPECT_EQ(line.back(), '\n');
            messages.push_back(line.substr(sizeof(prefix) - 1, line.size() - sizeof(prefix)));
        }
        return messages;
    }

    static bool waitFor(const std::string& message) {
        std::unique_lock<std::mutex> lock(mutex);
        return changed.wait_for(lock, std::chrono::seconds(20), [&] {
            return std::count(traced.begin(), traced.end(), prefix + message + "\n") > 0;
        });
    }

private:
    const zesdbg::Settings defaults_ = zesdbg::settings;
};

class ProbesTest : public testing::Test {
protected:
    ProbesTest() { zesdbg::settings.threshold = 256; }

    Traces traces;
};

TEST_F(ProbesTest, NothingIsWrittenAtTheDefaultThreshold) {
    EXPECT_EQ(levelEvent, 256U);
    for (const std::uint32_t threshold : {4096U, 257U}) {
        zesdbg::settings.threshold = threshold;
        const zeerr::LocalStatus status;
        const tExchangeProbe exchange(0x2000, 1, status);
        probeSleep(1);
        probeOffsets(8, 1);
        probeHostCall("f", -1);
    }
    EXPECT_EQ(Traces::messages(), Messages());
}

TEST_F(ProbesTest, WidestValuesAreWrittenWhole) {
    {
        zeerr::LocalStatus status;
        const tExchangeProbe exchange(0xFFFF, 65535, status);
        status.code = -2147483647 - 1;
    }
    probeSleep(4294967295);
    probeOffsets(1048576, -9223372036854775807 - 1);
    probeHostCall("zekel_getTime", 2147483647);
    EXPECT_EQ(Traces::messages(),
              (Messages{"exchange start: managementId 0xffff, sequenceId 65535",
                        "exchange end: managementId 0xffff, sequenceId 65535, code -2147483648",
                        "sleep chosen: 4294967295 us",
                        "offsets drained: 1048576 octets, kept -9223372036854775808 ns",
                        "host call: zekel_getTime, code 2147483647"}));
}

class ExchangeProbeTest : public ProbesTest {
protected:
    void SetUp() override {
        interface.open("local", status);
        ASSERT_EQ(status.code, 0);
    }

    const TemporaryFolder folder;
    const tUdsMsgAddress remote{"remote"};
    tUdsMsgInterface interface;
    tPtpMgmtNode node{tPtpPortIdentity(tPtpClockIdentity(), 1), 0};
    zeerr::LocalStatus status;
};

TEST_F(ExchangeProbeTest, SingleAndPortsTellOfOneStartAndOneEnd) {
    const FakePtp4l daemon("remote", 3);
    tPtp4lTimeStatusMgmtTlv timeStatus;
    node.getSingle(interface, remote, timeStatus, status);
    std::vector<tPortDataSetNp> answers;
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remote, 3, answers, status);
    EXPECT_EQ(answers.size(), 3U);
    EXPECT_EQ(Traces::messages(),
              (Messages{"exchange start: managementId 0xc000, sequenceId 0",
                        "exchange end: managementId 0xc000, sequenceId 0, code 0",
                        "exchange start: managementId 0xc002, sequenceId 1",
                        "exchange end: managementId 0xc002, sequenceId 1, "
                        "code 0"}));
}

TEST_F(ExchangeProbeTest, FailureEndsWithItsCode) {
    std::vector<tPortDataSetNp> answers;
    node.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface, remote, 3, answers, status);
    EXPECT_EQ(Traces::messages(), (Messages{"exchange start: managementId 0xc002, sequenceId 0",
                                            "exchange end: managementId 0xc002, sequenceId 0, "
                                            "code -52024"}));
}

TEST_F(ProbesTest, HostCallsTellTheirFunctionAndCode) {
    RecordingHost recorder;
    void* slot = nullptr;
    const tHost host(&slot);
    host.getTime();
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = 7; });
    host.adjustTime(1, 2);
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = -52009; });
    EXPECT_THROW(host.setQuality(tQuality::usable, "why"), zeerr::Exception);
    EXPECT_THROW(host.updateMetaData("{}"), zeerr::Exception);
    EXPECT_EQ(Traces::messages(),
              (Messages{"host call: zekel_getTime, code 0", "host call: zekel_adjustTime, code 7",
                        "host call: zekel_setTRQuality, code -52009",
                        "host call: zekel_updateMetaData, code -52009"}));
}

/// A session with a daemon of the test's; the one that it would run is not there.
class SessionProbesTest : public ProtocolConfigFixture {
protected:
    SessionProbesTest() {
        zesdbg::settings.threshold = 256;
        set("udsAddress", "\"remote\"");
        recorder.setTime(0x1797AB0123456789 + 50000000);
    }

    /// Runs it for one pass. @return what is traced from the first sleep to the second. The
    /// quality is left out: the watchdog reports one at any time.
    Messages firstPass() {
        tPtp4lTimeRef timeRef(&slot, text());
        timeRef.start();
        EXPECT_TRUE(Traces::waitFor("sleep chosen: 78000 us"));
        timeRef.stop();
        Messages lines = Traces::messages();
        lines.erase(
            std::remove(lines.begin(), lines.end(), "host call: zekel_setTRQuality, code 0"),
            lines.end());
        const auto first = std::find(lines.begin(), lines.end(), "sleep chosen: 125000 us");
        return {first, std::next(std::find(first, lines.end(), "sleep chosen: 78000 us"))};
    }

    Traces traces;
    RecordingHost recorder;
    void* slot = nullptr;
    const FakePtp4l daemon{"remote", 1};
};

TEST_F(SessionProbesTest, PassTellsAllThatItDoes) {
    tSharedFifo fifo(epochFifoPath, true, status);
    const std::int64_t offsets[] = {5, -7};
    ASSERT_EQ(fifo.write(offsets, sizeof(offsets), status), 16);
    EXPECT_EQ(
        firstPass(),
        (Messages{"sleep chosen: 125000 us", "exchange start: managementId 0xc000, sequenceId 0",
                  "exchange end: managementId 0xc000, sequenceId 0, code 0",
                  "exchange start: managementId 0x2002, sequenceId 1",
                  "exchange end: managementId 0x2002, sequenceId 1, code 0",
                  "exchange start: managementId 0x2000, sequenceId 2",
                  "exchange end: managementId 0x2000, sequenceId 2, code 0",
                  "exchange start: managementId 0x2004, sequenceId 3",
                  "exchange end: managementId 0x2004, sequenceId 3, code 0",
                  "exchange start: managementId 0xc002, sequenceId 4",
                  "exchange end: managementId 0xc002, sequenceId 4, code 0",
                  "exchange start: managementId 0xc004, sequenceId 5",
                  "exchange end: managementId 0xc004, sequenceId 5, code 0",
                  "host call: zekel_getTime, code 0", "offsets drained: 16 octets, kept -7 ns",
                  "host call: zekel_adjustTime, code 0", "host call: zekel_updateMetaData, code 0",
                  "sleep chosen: 78000 us"}));
}

} // namespace
