#include "SessionRun.h"

#include <csignal>
#include <filesystem>
#include <thread>

#include <fmt/format.h>

#include "HostStatus.h"
#include "Plan.h"
#include "support/Processes.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr std::chrono::milliseconds tick{20};
constexpr std::chrono::seconds longestPoll{30};
constexpr double recoveryLimit = 20;
constexpr double deathLimit = 15;
// What may be under way when the session is stopped, after the windows with faults: one answer that
// does not come, the watchdog's sleep, the calls of a poll, and the daemon that has to be killed.
constexpr double answer = 2;
constexpr double watchdog = 1;
constexpr double blockingCalls = 4;
constexpr double untilKilled = 10;
// What a busy machine adds: to everything, and to a thousand sleeps until the daemon is killed.
constexpr double slack = 2;
constexpr double slackUntilKilled = 3;
constexpr std::chrono::milliseconds beforeStop{200}; // longer than a worker's sleep
constexpr std::uint64_t enough = 3;                  // polls and pairs, to have recovered
constexpr int pipeIsFull = 60000;
constexpr char half[] = "\1\2\3";
constexpr char otherHalf[] = "\4\5\6\7\10";

std::string configuration(int ports) {
    std::string interfaces;
    for (int port = 0; port < ports; ++port) {
        interfaces += fmt::format(R"({}"sim{}")", port == 0 ? "" : ",", port);
    }
    return R"({"neighborPropDelayThreshold":20000000,"logAnnounceInterval":1,)"
           R"("logSyncInterval":-3,"priority1":127,"priority2":126,)"
           R"("offsetScaledLogVariance":65535,"udsAddress":"ptp4l.sock","transportSpecific":"0x0",)"
           R"("syncReceiptTimeout":0,"assumeTwoStep":false,"pathTraceEnabled":false,)"
           R"("followUpInfo":false,"networkTransport":"UDPv4","delayMechanism":"E2E",)"
           R"("configFile":"ptp4l.conf","ptpDstMac":"01:00:5e:00:01:81","interface":[)" +
           interfaces + "]}";
}

} // namespace

SessionRun::SessionRun(const vantelhost::PlugIn& plugIn, SoakHost& host, const SessionPlan& plan)
    : plugIn_(plugIn), host_(host), plan_(plan), deathsBefore_(host.counts().deaths) {}

std::string SessionRun::run(const std::string& program, const std::function<bool()>& goesOn) {
    provideDaemon(program);
    if (plan_.fifoAtStart) {
        fifo_.emplace();
    }
    std::string failure = initialise();
    if (!failure.empty() || plan_.ending == Ending::badConfiguration) {
        return failure;
    }
    host_.expect(&slot_);
    failure = start();
    if (failure.empty() && plan_.ending != Ending::startRefused) {
        failure = attend(goesOn);
    }
    const std::string stopFailure = end();
    failure = failure.empty() ? stopFailure : failure;
    return failure.empty() ? host_.violation() : failure;
}

double SessionRun::seconds() const {
    return std::chrono::duration<double>(Clock::now() - begin_).count();
}

void SessionRun::provideDaemon(const std::string& program) const {
    std::filesystem::remove("ptp4l");
    if (plan_.ending != Ending::noProgram) {
        std::filesystem::create_symlink(program, "ptp4l");
    }
    writeFile("ptp4l.conf.sim", plan_.script);
}

std::string SessionRun::initialise() {
    const bool bad = plan_.ending == Ending::badConfiguration;
    vantelhost::HostStatus status;
    plugIn_.initialise(&slot_, bad ? R"({"interface":[]})" : configuration(plan_.ports), status);
    if (status.isError() != bad) {
        return fmt::format("zekeltr_initialize: {} {}", status.code(), status.text());
    }
    return "";
}

std::string SessionRun::start() {
    const bool refused = plan_.ending == Ending::startRefused;
    if (refused) {
        host_.misbehave(HostFault::refusal);
    }
    vantelhost::HostStatus status;
    plugIn_.start(&slot_, status);
    begin_ = Clock::now();
    host_.misbehave(HostFault::none);
    if (status.isError() != refused) {
        return fmt::format("zekeltr_start: {} {}", status.code(), status.text());
    }
    return "";
}

std::string SessionRun::attend(const std::function<bool()>& goesOn) {
    std::string failure;
    while (failure.empty() && goesOn() && !isOver()) {
        performDeeds();
        feedFifo();
        std::this_thread::sleep_for(tick);
        failure = overdue();
    }
    return failure;
}

std::string SessionRun::end() {
    host_.misbehave(plan_.faultAtStop);
    std::this_thread::sleep_for(beforeStop);
    const double begin = seconds();
    plugIn_.stop(&slot_);
    stopSeconds_ = seconds() - begin;
    plugIn_.finalise(&slot_);
    host_.misbehave(HostFault::none);
    host_.expect(nullptr);
    // A daemon that had to be killed is not waited for by the plug-in.
    endChildren();
    if (stopSeconds_ > stopLimit()) {
        return fmt::format("zekeltr_stop took {:.2f} s of {} allowed", stopSeconds_, stopLimit());
    }
    return "";
}

double SessionRun::stopLimit() const {
    const bool blocks = plan_.faultAtStop == HostFault::block;
    const bool isKilled = daemonIsFrozen_ || plan_.ending == Ending::stoppedWhileIgnoring;
    return answer + watchdog + slack + (blocks ? blockingCalls : 0) +
           (isKilled ? untilKilled + slackUntilKilled : 0);
}

bool SessionRun::isOver() {
    if (isDeath(plan_.ending)) {
        return host_.counts().deaths > deathsBefore_;
    }
    return plan_.ending == Ending::recovered ? hasRecovered() : seconds() >= plan_.length;
}

bool SessionRun::hasRecovered() {
    if (seconds() < Plan::lastRole(plan_)) {
        return false;
    }
    const SoakHost::Counts counts = host_.counts();
    if (!beforeRecovery_) {
        beforeRecovery_ = counts;
    }
    return host_.isUsable() && counts.polls >= beforeRecovery_->polls + enough &&
           counts.pairs >= beforeRecovery_->pairs + enough;
}

std::string SessionRun::overdue() const {
    const SoakHost::Counts counts = host_.counts();
    if (Clock::now() - host_.lastPoll() > longestPoll) {
        return fmt::format("no poll for {} s", longestPoll.count());
    }
    if (isDeath(plan_.ending) && seconds() > plan_.length + deathLimit) {
        return fmt::format("the death of the daemon is not reported within {} s", deathLimit);
    }
    if (beforeRecovery_ && seconds() > Plan::lastRole(plan_) + recoveryLimit) {
        return fmt::format("no recovery within {} s: {} quality, {} polls, {} pairs", recoveryLimit,
                           host_.isUsable() ? "usable" : "unusable",
                           counts.polls - beforeRecovery_->polls,
                           counts.pairs - beforeRecovery_->pairs);
    }
    return "";
}

void SessionRun::performDeeds() {
    while (performed_ < plan_.deeds.size() && plan_.deeds[performed_].at <= seconds()) {
        perform(plan_.deeds[performed_++]);
    }
}

void SessionRun::perform(const Deed& deed) {
    const auto signalDaemon = [](int signal) {
        for (const pid_t child : children()) {
            kill(child, signal);
        }
    };
    switch (deed.what) {
    case Deed::What::freezeDaemon:
        daemonIsFrozen_ = true;
        return signalDaemon(SIGSTOP);
    case Deed::What::thawDaemon:
        daemonIsFrozen_ = false;
        return signalDaemon(SIGCONT);
    case Deed::What::killDaemon:
        return signalDaemon(SIGKILL);
    case Deed::What::misbehave:
        return host_.misbehave(deed.fault);
    case Deed::What::removeFifo:
        return fifo_.reset();
    case Deed::What::createFifo:
        if (!fifo_) {
            fifo_.emplace();
        }
        return;
    case Deed::What::fillFifo:
        return write(std::string(pipeIsFull, '\0'));
    case Deed::What::tearFifo:
        fifoIsTorn_ = true;
        return write(half);
    case Deed::What::mendFifo:
        write(otherHalf);
        fifoIsTorn_ = false;
    }
}

void SessionRun::feedFifo() {
    if (fifoIsTorn_ || seconds() < nextOffset_) {
        return;
    }
    nextOffset_ = seconds() + plan_.fifoPeriod;
    const auto offset = static_cast<std::int64_t>(seconds() * 1e9);
    write({reinterpret_cast<const char*>(&offset), sizeof(offset)});
}

void SessionRun::write(const std::string& octets) const {
    if (fifo_ && fifo_->queued() + static_cast<int>(octets.size()) <= pipeIsFull) {
        fifo_->writeOctets(octets);
    }
}
