#include "Plan.h"

#include <algorithm>
#include <array>

#include <fmt/format.h>

namespace {

constexpr double calm = 1;        // before the first fault
constexpr double withoutRole = 3; // longer than a time-out of 2 s, so that a poll sees it
constexpr double recovery = 6;    // what a session adds to its faults
constexpr double stopping = 2;    // what zekeltr_stop takes, about
constexpr double killing = 10;    // the same, when SIGTERM does not help
constexpr double longestEnding = 25;
constexpr double shortestPair = 12; // of sessions, the second of which recovers

constexpr std::array faultsAtStop{
    HostFault::error,     HostFault::stopping,         HostFault::warning,
    HostFault::exception, HostFault::foreignException, HostFault::block};

bool hasNoFaults(Ending ending) {
    return ending == Ending::exitedAtOnce || ending == Ending::noProgram ||
           ending == Ending::startRefused || ending == Ending::badConfiguration;
}

bool isSlow(Ending ending) {
    return ending == Ending::stoppedWhileFrozen || ending == Ending::stoppedWhileIgnoring;
}

} // namespace

Plan::Plan(std::uint64_t seed, int seconds) : dice_(seed), seconds_(seconds) {}

bool Plan::next(SessionPlan& session) {
    if (recovers_ && planned_ > 0 && planned_ + shortestPair > seconds_) {
        return false;
    }
    recovers_ = !recovers_;
    Ending ending = Ending::recovered;
    while (!recovers_ && ending == Ending::recovered) {
        ending = static_cast<Ending>(1 + endings_.deal(dice_));
        if (isSlow(ending) && seconds_ < 6 * killing) {
            ending = Ending::recovered; // no time for it: another one
        }
    }
    begin(session, ending);
    if (!hasNoFaults(ending)) {
        addFaults(session);
    }
    end(session);
    if (dice_.below(2) == 0) {
        session.faultAtStop = dice_.pick(faultsAtStop);
    }
    planned_ += session.length + stopping + (isSlow(ending) ? killing : 0);
    return true;
}

double Plan::lastRole(const SessionPlan& session) {
    return session.faultsEnd + calm + withoutRole;
}

void Plan::begin(SessionPlan& session, Ending ending) {
    session = SessionPlan();
    session.ending = ending;
    session.ports = static_cast<int>(1 + dice_.below(4));
    session.fifoPeriod = dice_.between(0.05, 2);
    if (hasNoFaults(ending)) {
        return;
    }
    const double longest =
        std::clamp(seconds_ / 4, 10.0, ending == Ending::recovered ? 180.0 : longestEnding);
    session.length = dice_.between(std::max(8.0, longest / 2), longest);
    session.faultsEnd = session.length - recovery;
    session.script = fmt::format("seed {}\noffset {}\njitter 50\n", dice_.below(1000000),
                                 static_cast<int>(dice_.below(2000)) - 1000);
    if (dice_.below(3) == 0) {
        session.script += "padding strict\n";
        session.faults.push_back({"strict padding", calm});
    }
    if (dice_.below(3) == 0) {
        const double delay = dice_.between(0.1, 2);
        session.script += fmt::format("start-delay {:.2f}\n", delay);
        session.faults.push_back({"start-delay", delay});
    }
    if (dice_.below(3) == 0) {
        session.fifoAtStart = false;
        session.deeds.push_back({calm, Deed::What::createFifo});
        session.faults.push_back({"no FIFO at start", calm});
    }
}

// One or two faults at a time, with healthy pauses between; shorter ones in a short session.
void Plan::addFaults(SessionPlan& session) {
    const double longestFault = std::clamp(session.length / 5, 1.0, 4.0);
    const double longestPause = std::clamp(session.length / 8, 0.5, 3.0);
    double from = calm;
    while (from < session.faultsEnd) {
        const double until = std::min(from + dice_.between(0.5, longestFault), session.faultsEnd);
        FaultWindow window(session, dice_, from, until);
        window.add(faults_.deal(dice_));
        if (dice_.below(3) == 0) {
            window.add(faults_.deal(dice_));
        }
        from = until + dice_.between(0.3, longestPause);
    }
    std::stable_sort(session.deeds.begin(), session.deeds.end(),
                     [](const Deed& a, const Deed& b) { return a.at < b.at; });
}

void Plan::end(SessionPlan& session) {
    switch (session.ending) {
    case Ending::recovered:
        session.script += fmt::format("at {:.2f} do gm off\nat {:.2f} do gm on\n",
                                      session.faultsEnd + calm, lastRole(session));
        session.length = lastRole(session);
        break;
    case Ending::exited:
        session.script += fmt::format("at {:.2f} do exit {}\n", session.length, dice_.below(256));
        break;
    case Ending::killed:
        session.deeds.push_back({session.length, Deed::What::killDaemon});
        break;
    case Ending::exitedAtOnce:
        session.script = fmt::format("exit-at-once {}\n", dice_.below(256));
        break;
    case Ending::stoppedInFault:
        session.script += fmt::format("on any from {:.2f} do silence\n", session.faultsEnd);
        break;
    case Ending::stoppedWhileFrozen:
        session.deeds.push_back({session.faultsEnd, Deed::What::freezeDaemon});
        break;
    case Ending::stoppedWhileIgnoring:
        session.script += "ignore SIGTERM\n";
        break;
    case Ending::noProgram:
    case Ending::startRefused:
    case Ending::badConfiguration:
        break;
    }
}
