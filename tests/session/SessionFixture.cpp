#include "SessionFixture.h"

#include <algorithm>
#include <atomic>
#include <memory>
#include <ostream>
#include <utility>

#include <unistd.h>

#include "Interposed.h"

namespace {

constexpr char udsAddress[] = "ptp4l.sock";

const Plugin& plugin() {
    static const Plugin loaded;
    return loaded;
}

} // namespace

const char simulatorProgram[] = VANTEL_SIMPTP4L;

const char defaultMetaData[] =
    R"({"gmClockId":"00:00:00:00:00:00:00:00","gmMacAddress":"00:00:00:00:00:00",)"
    R"("localClockId":"00:00:00:00:00:00:00:00","clockClass":0,)"
    R"("clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":0,"priority1":0,"priority2":0,)"
    R"("domainNumber":0,"gmClockClass":0,"gmClockAccuracy":"ACCURACY_UNKNOWN",)"
    R"("gmOffsetLogVariance":0,"gmPriority1":0,"gmPriority2":0})";

std::string sessionConfiguration(const std::string& interfaces,
                                 const std::string& transportSpecific) {
    return R"({"neighborPropDelayThreshold":20000000,"logAnnounceInterval":1,)"
           R"("logSyncInterval":-3,"priority1":127,"priority2":126,)"
           R"("offsetScaledLogVariance":65535,"udsAddress":")" +
           std::string(udsAddress) + R"(","transportSpecific":")" + transportSpecific +
           R"(","syncReceiptTimeout":0,"assumeTwoStep":false,"pathTraceEnabled":false,)"
           R"("followUpInfo":false,"networkTransport":"UDPv4","delayMechanism":"E2E",)"
           R"("configFile":")" +
           SimulatedDaemon::configFile + R"(","ptpDstMac":"01:00:5e:00:01:81","interface":)" +
           interfaces + "}";
}

Session::~Session() {
    const ShortSleeps hurry;
    stop();
    finalise();
}

void Session::initialise(const std::string& configuration) {
    HostStatus status;
    plugin().initialize(&slot_, configuration.c_str(), &status);
    ASSERT_EQ(status.code, 0) << status.text();
}

void Session::start() {
    HostStatus status;
    start(status);
    ASSERT_EQ(status.code, 0) << status.text();
}

void Session::start(zeerr_Status& status) {
    plugin().start(&slot_, &status);
}

void Session::stop() {
    if (slot_ != nullptr) {
        plugin().stop(&slot_);
    }
}

void Session::finalise() {
    void* const before = slot_;
    plugin().finalize(&slot_);
    EXPECT_EQ(slot_, before);
    slot_ = nullptr;
}

void PrintTo(const QualityReport& report, std::ostream* out) {
    *out << (report.usable ? "usable: " : "unusable: ") << report.reason;
}

SessionTest::SessionTest() : daemon(simulatorProgram) {
    forgetSentSignals();
    forgetSleeps();
    fifo.emplace();
}

void SessionTest::begin(const std::string& script, const std::string& interfaces) {
    SimulatedDaemon::script(script);
    session.initialise(sessionConfiguration(interfaces));
    // A daemon that is to bind its socket late is awaited no longer than until it runs.
    const std::string ready = script.find("start-delay") == std::string::npos ? "bound" : "start";
    const std::size_t former = SimulatedDaemon::events(ready).size();
    const HeldPolls untilItIsReady;
    session.start();
    waitUntil([&] {
        return SimulatedDaemon::events(ready).size() > former || hasDeadChild() || !hasChildren();
    });
}

void SessionTest::beginMeasured(std::vector<FakePtp4l::Measurement> polls) {
    answers = std::make_unique<FakePtp4l>(udsAddress, std::move(polls));
    begin("start-delay 1000000\n");
}

bool SessionTest::waitForCalls(Function function, std::size_t count) {
    return host.waitFor([=](const Calls& calls) {
        return std::count_if(calls.begin(), calls.end(), [=](const RecordingHost::Call& call) {
                   return call.function == function;
               }) >= static_cast<std::ptrdiff_t>(count);
    });
}

bool SessionTest::waitForLog(const std::string& text, int count) {
    return waitUntil([&] { return log.count(text) >= count; });
}

std::vector<QualityReport> SessionTest::qualities() const {
    std::vector<QualityReport> reports;
    for (const auto& call : host.calls(Function::setTRQuality)) {
        reports.push_back({call.text, call.quality == decltype(call.quality){2.5e-08, 1e-06, -1}});
        EXPECT_TRUE(reports.back().usable || call.quality == (decltype(call.quality){-2, -2, -1}));
    }
    return reports;
}

std::vector<std::string> SessionTest::metaData() const {
    std::vector<std::string> texts;
    for (const auto& call : host.calls(Function::updateMetaData)) {
        texts.push_back(call.text);
    }
    return texts;
}

void SessionTest::onEachPoll(const std::function<void(int poll)>& action) {
    // The host copies its reaction for each call, so the count must not be part of it.
    const auto poll = std::make_shared<std::atomic<int>>(0);
    host.onCall([=](const RecordingHost::Call& call, zeerr_Status&) {
        if (call.function == Function::getTime) {
            action((*poll)++);
        }
    });
}

void SessionTest::expectOwnThreads(int count) const {
    waitUntil([=] { return threadCount() == threadsBefore.count() + count; });
    EXPECT_EQ(threadCount(), threadsBefore.count() + count);
}

std::string SessionTest::socketPath() {
    return "ptp4lTimeRef." + std::to_string(getpid());
}
