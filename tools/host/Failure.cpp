#include "Failure.h"

#include <cmath>
#include <utility>

namespace vantelhost {

namespace {

constexpr char askCheck[] = "\"vantel-host check\" with the same settings says what is wrong";

Failure ofDaemon(const RunFacts& facts) {
    if (!facts.daemonMend.empty()) {
        return {facts.daemonEnd, facts.daemonMend};
    }
    return {facts.daemonEnd,
            facts.tally.wasUsable ? "look in the system's log for why, and start again" : askCheck};
}

/// Why no time pair came, though ptp4l runs.
Failure withoutPairs(const RunFacts& facts) {
    const std::string begin = "no time pair came: ";
    if (!facts.tally.hasPorts && !facts.tally.wasUsable) {
        return {begin + "ptp4l does not answer", askCheck};
    }
    if (!facts.tally.wasUsable) {
        return {begin + "no grandmaster was heard",
                "look at the link, networkTransport, transportSpecific and the portState in the "
                "metadata"};
    }
    if (!facts.fifoIsThere) {
        return {begin + "there is no epoch FIFO " + facts.fifo,
                "start who writes to it, or run with --create-fifo"};
    }
    return {begin + "a grandmaster is there, its Syncs are not measured",
            "look in ptp4l's log for \"received SYNC without timestamp\""};
}

} // namespace

double patienceFor(const Json& settings) {
    const auto found = settings.find("logAnnounceInterval");
    const bool known = found != settings.end() && found->is_number_integer();
    return 5 + 4 * std::exp2(known ? found->get<int>() : 1);
}

std::optional<Failure> failureOf(const RunFacts& facts) {
    if (!facts.daemonEnd.empty()) {
        return ofDaemon(facts);
    }
    if (facts.tally.offsets.count == 0) {
        return facts.seconds > facts.patience ? std::optional(withoutPairs(facts)) : std::nullopt;
    }
    if (auto frozen = frozenOffsets(facts.tally.offsets); !frozen.empty()) {
        return Failure{std::move(frozen), "--set delayMechanism=..., as the network has it"};
    }
    if (!facts.chronyFailure.empty()) {
        return Failure{"chronyd " + facts.chronyFailure,
                       "start chronyd with \"refclock SOCK\" and that path"};
    }
    return std::nullopt;
}

} // namespace vantelhost
