#include "SessionPlan.h"

#include <fmt/format.h>

namespace {

const char* nameOf(Deed::What what) {
    switch (what) {
    case Deed::What::freezeDaemon:
        return "SIGSTOP";
    case Deed::What::thawDaemon:
        return "SIGCONT";
    case Deed::What::killDaemon:
        return "SIGKILL";
    case Deed::What::misbehave:
        return "host";
    case Deed::What::removeFifo:
        return "FIFO removed";
    case Deed::What::createFifo:
        return "FIFO created";
    case Deed::What::fillFifo:
        return "FIFO filled";
    case Deed::What::tearFifo:
        return "half a value";
    case Deed::What::mendFifo:
        return "its other half";
    }
    return "";
}

const char* nameOf(HostFault fault) {
    switch (fault) {
    case HostFault::none:
        return "behaves";
    case HostFault::error:
        return "gives errors";
    case HostFault::refusal:
        return "refuses";
    case HostFault::stopping:
        return "says it is stopping";
    case HostFault::warning:
        return "gives warnings";
    case HostFault::exception:
        return "throws";
    case HostFault::foreignException:
        return "throws a number";
    case HostFault::block:
        return "blocks";
    }
    return "";
}

} // namespace

const char* nameOf(Ending ending) {
    switch (ending) {
    case Ending::recovered:
        return "recovered";
    case Ending::exited:
        return "exited";
    case Ending::killed:
        return "killed";
    case Ending::exitedAtOnce:
        return "exited at once";
    case Ending::noProgram:
        return "no program";
    case Ending::stoppedInFault:
        return "stopped in a fault";
    case Ending::startRefused:
        return "start refused";
    case Ending::badConfiguration:
        return "bad configuration";
    case Ending::stoppedWhileFrozen:
        return "stopped while frozen";
    case Ending::stoppedWhileIgnoring:
        return "SIGTERM ignored";
    }
    return "";
}

bool isDeath(Ending ending) {
    return ending == Ending::exited || ending == Ending::killed || ending == Ending::exitedAtOnce ||
           ending == Ending::noProgram;
}

std::string textOf(const SessionPlan& plan) {
    std::string text = fmt::format(
        "# {:.2f} s, {} ports, an epoch offset every {:.2f} s, {} at start, ends: {}\n{}",
        plan.length, plan.ports, plan.fifoPeriod, plan.fifoAtStart ? "FIFO" : "no FIFO",
        nameOf(plan.ending), plan.script);
    for (const Deed& deed : plan.deeds) {
        text += fmt::format("# at {:.2f} {}", deed.at, nameOf(deed.what));
        if (deed.what == Deed::What::misbehave) {
            text += fmt::format(" {}", nameOf(deed.fault));
        }
        text += '\n';
    }
    if (plan.faultAtStop != HostFault::none) {
        text += fmt::format("# at the stop host {}\n", nameOf(plan.faultAtStop));
    }
    return text;
}
