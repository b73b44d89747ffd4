#include "Simulator.h"

#include "Answer.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <iostream>
#include <poll.h>
#include <system_error>

namespace simptp4l {
namespace {

constexpr int masterState = 6;
constexpr int uncalibratedState = 8;
constexpr std::int64_t second = 1000000000;
constexpr std::int64_t longestWait = 3600 * second;

std::int64_t monotonic() {
    timespec time{};
    clock_gettime(CLOCK_MONOTONIC, &time);
    return std::int64_t{time.tv_sec} * second + time.tv_nsec;
}

std::vector<TimedAction> byTime(std::vector<TimedAction> actions) {
    std::stable_sort(
        actions.begin(), actions.end(),
        [](const TimedAction& left, const TimedAction& right) { return left.time < right.time; });
    return actions;
}

} // namespace

Simulator::Simulator(const Config& config, const Script& script,
                     const std::vector<std::string>& interfaces, Log& log)
    : config_(config),
      script_(script),
      interfaces_(interfaces),
      ports_(script.ports.value_or(static_cast<unsigned>(interfaces.size()))),
      log_(log),
      start_(monotonic()),
      clock_(script_, config.logSyncInterval, start_),
      rules_(script.rules),
      random_(script.seed),
      socket_(config.udsAddress),
      timed_(byTime(script.timedActions)) {}

int Simulator::run() {
    while (!exit_) {
        wait();
        takeSignals();
        doTimed();
        if (!exit_) {
            readSocket();
        }
        outbox_.send(now(), socket_, log_);
    }
    return *exit_;
}

std::int64_t Simulator::now() const {
    return monotonic() - start_;
}

std::int64_t Simulator::wakeTime(std::int64_t now) const {
    std::int64_t wake = outbox_.next(now).value_or(now + longestWait);
    if (!started_) {
        wake = std::min(wake, script_.startDelay);
    }
    if (!timed_.empty()) {
        wake = std::min(wake, timed_.front().time);
    }
    if (now < readAgain_) {
        wake = std::min(wake, readAgain_);
    }
    return wake;
}

void Simulator::wait() {
    const std::int64_t current = now();
    const std::int64_t duration = std::max<std::int64_t>(wakeTime(current) - current, 0);
    timespec timeout{};
    timeout.tv_sec = static_cast<decltype(timeout.tv_sec)>(duration / second);
    timeout.tv_nsec = static_cast<decltype(timeout.tv_nsec)>(duration % second);
    // A negative descriptor is skipped by poll.
    const int readable = current < readAgain_ ? -1 : socket_.descriptor();
    pollfd polled[] = {{signals_.descriptor(), POLLIN, 0}, {readable, POLLIN, 0}};
    ppoll(polled, 2, &timeout, nullptr);
}

void Simulator::takeSignals() {
    while (const int number = signals_.next()) {
        const std::vector<int>& kept = script_.ignoredSignals;
        const bool ignored = std::find(kept.begin(), kept.end(), number) != kept.end();
        log_.signal(now(), signalName(number), ignored);
        if (!ignored) {
            exit_ = 0;
        }
    }
}

void Simulator::doTimed() {
    const std::int64_t current = now();
    if (!started_ && current >= script_.startDelay) {
        started_ = true;
        bind();
    }
    while (!timed_.empty() && timed_.front().time <= current) {
        const Action action = timed_.front().action;
        timed_.erase(timed_.begin());
        applyToSelf(action, current);
    }
}

void Simulator::bind() {
    if (socket_.bind()) {
        log_.bound(now(), socket_.path());
        return;
    }
    const std::string text =
        socket_.path() + ": cannot bind: " + std::generic_category().message(errno);
    std::cerr << "simptp4l: " << text << std::endl;
    log_.error(text);
    exit_ = 1;
}

void Simulator::readSocket() {
    // One datagram a turn, so that signals and times are looked at in between.
    if (socket_.descriptor() < 0 || now() < readAgain_) {
        return;
    }
    const std::optional<Datagram> datagram = socket_.receive();
    if (datagram) {
        handle(*datagram);
    }
}

void Simulator::handle(const Datagram& datagram) {
    const std::int64_t current = now();
    const Acceptance acceptance{static_cast<std::uint8_t>(config_.transportSpecific),
                                static_cast<std::uint8_t>(config_.domainNumber),
                                script_.clockIdentity, script_.strictPadding,
                                script_.strictFollowUpInfo && config_.followUpInfo == 1};
    std::string ignored;
    const std::optional<Request> request = readRequest(datagram.octets, acceptance, ignored);
    if (request && !datagram.from.canBeAnswered()) {
        ignored = "sender has no address";
    }
    log_.request(current, datagram.octets, datagram.from.text(), ignored);
    if (!ignored.empty()) {
        return;
    }
    Plan plan = planFor(*request, ports_);
    for (const Action& action : rules_.match(request->managementId, current)) {
        applyToSelf(action, current);
        apply(action, plan);
    }
    if (!exit_) {
        answer(*request, datagram.from, plan, current);
    }
}

void Simulator::answer(const Request& request, const Address& to, const Plan& plan,
                       std::int64_t now) {
    const std::int64_t due = now + plan.delay;
    for (const Held& held : held_) {
        outbox_.add(due, held.octets, held.to);
    }
    held_.clear();
    for (const Answer& each : plan.answers) {
        const Octets octets = encodeAnswer(each, request, viewOf(each.port, now),
                                           static_cast<std::uint8_t>(config_.transportSpecific),
                                           script_.overrides, random_);
        if (plan.late) {
            held_.push_back({octets, to});
        } else {
            outbox_.add(due, octets, to);
        }
    }
}

void Simulator::applyToSelf(const Action& action, std::int64_t now) {
    switch (action.kind) {
    case ActionKind::gm:
        clock_.setGrandmaster(action.value != 0, now);
        break;
    case ActionKind::clockStep:
        clock_.step(action.value);
        break;
    case ActionKind::stopReading:
        readAgain_ = now + action.value;
        break;
    case ActionKind::exit:
        exit_ = static_cast<int>(action.value);
        break;
    case ActionKind::unbind:
        socket_.unbind();
        break;
    case ActionKind::rebind:
        bind();
        break;
    default:
        break;
    }
}

View Simulator::viewOf(unsigned port, std::int64_t now) {
    const ClockReading reading = clock_.read(now);
    View view;
    view.clockIdentity = script_.clockIdentity;
    view.port = port;
    view.numberPorts = ports_;
    view.portState = portState(port, reading);
    view.interface = interfaceName(port);
    view.gmPresent = reading.gmPresent;
    view.gmIdentity = reading.gmPresent ? script_.gmIdentity : script_.clockIdentity;
    view.masterOffset = reading.masterOffset;
    view.ingressTime = reading.ingressTime;
    view.domainNumber = config_.domainNumber;
    view.flags = config_.twoStepFlag | config_.slaveOnly << 1;
    view.priority1 = config_.priority1;
    view.priority2 = config_.priority2;
    view.clockClass = config_.clockClass;
    view.clockAccuracy = config_.clockAccuracy;
    view.offsetScaledLogVariance = config_.offsetScaledLogVariance;
    view.logMinDelayReqInterval = config_.logMinDelayReqInterval;
    view.logAnnounceInterval = config_.logAnnounceInterval;
    view.announceReceiptTimeout = config_.announceReceiptTimeout;
    view.logSyncInterval = config_.logSyncInterval;
    view.delayMechanism = config_.delayMechanism;
    view.logMinPdelayReqInterval = config_.logMinPdelayReqInterval;
    view.neighborPropDelayThresh = config_.neighborPropDelayThresh;
    view.timestamping = config_.timestamping;
    return view;
}

int Simulator::portState(unsigned port, const ClockReading& reading) const {
    const auto forced = script_.portStates.find(port);
    if (forced != script_.portStates.end()) {
        return forced->second;
    }
    if (port != 1) {
        return masterState;
    }
    // A ptp4l that is free-running never gets beyond it.
    if (reading.gmPresent) {
        return uncalibratedState;
    }
    return reading.gmSeen ? masterState : listeningState;
}

std::string Simulator::interfaceName(unsigned port) const {
    const auto named = script_.interfaceNames.find(port);
    if (named != script_.interfaceNames.end()) {
        return named->second;
    }
    if (port >= 1 && port <= interfaces_.size()) {
        return interfaces_[port - 1];
    }
    return "sim" + std::to_string(port);
}

} // namespace simptp4l
