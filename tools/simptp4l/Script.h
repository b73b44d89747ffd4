/// @file
/// What a script says, once read. Times and durations are nanoseconds.
#pragma once

#include "Fields.h"

#include <cstdint>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace simptp4l {

enum class ActionKind {
    silence,
    delay,
    drop,
    duplicate,
    reorder,
    length,
    answers,
    garbage,
    error,
    otherPort,
    flood,
    late,
    gm,
    clockStep,
    stopReading,
    exit,
    unbind,
    rebind
};

struct Action {
    ActionKind kind = ActionKind::silence;
    std::int64_t value = 0;
    bool relative = false; ///< `length` and `answers`: value is a difference
};

/// `on SELECTOR ... do ACTION`
struct Rule {
    std::optional<std::uint16_t> managementId; ///< empty: any
    std::int64_t from = 0;
    std::int64_t until = std::numeric_limits<std::int64_t>::max();
    std::uint64_t after = 0;
    std::uint64_t times = std::numeric_limits<std::uint64_t>::max();
    Action action;
};

/// `at T do ACTION`
struct TimedAction {
    std::int64_t time = 0;
    Action action;
};

enum class ClockSource { realtime, monotonic, fixed, steered };

struct Script {
    std::int64_t offset = 0;
    double driftPpb = 0;
    std::int64_t jitter = 0;
    std::uint64_t seed = 1;
    std::optional<std::int64_t> syncInterval;
    std::uint64_t syncsBeforeDelay = 1; ///< of each grandmaster
    ClockSource clock = ClockSource::realtime;
    std::int64_t fixedTime = 0;
    std::string steeredFile;      ///< holds a SteeredTime
    std::int64_t clockOffset = 0; ///< by which the ingress time is ahead of that clock

    bool gmPresent = true;
    std::int64_t gmAfter = 0;
    std::uint64_t gmIdentity = 0x001B21FFFE0A0B0C;
    std::uint64_t clockIdentity = 0x020000FFFE000001;

    std::optional<unsigned> ports;
    std::map<unsigned, std::string> interfaceNames;
    std::map<unsigned, std::uint8_t> portStates;
    bool strictPadding = false;
    bool strictFollowUpInfo = false;

    std::string log; ///< empty: none
    std::vector<int> ignoredSignals;
    std::optional<int> exitAtOnce;
    std::int64_t startDelay = 0;

    std::vector<Override> overrides;
    std::vector<Rule> rules;
    std::vector<TimedAction> timedActions;
};

} // namespace simptp4l
