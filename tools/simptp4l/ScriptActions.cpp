#include "ScriptActions.h"

#include <string>

namespace simptp4l {
namespace {

enum class Argument {
    none,
    duration,
    seconds,
    indexOrAll,
    optionalIndex,
    length,
    change,
    octets,
    code,
    count,
    onOff,
    status
};

struct ActionWord {
    const char* word;
    ActionKind kind;
    Argument argument;
    bool needsRequest;
};

constexpr ActionWord actionWords[] = {
    {"silence", ActionKind::silence, Argument::none, true},
    {"delay", ActionKind::delay, Argument::duration, true},
    {"drop", ActionKind::drop, Argument::indexOrAll, true},
    {"duplicate", ActionKind::duplicate, Argument::optionalIndex, true},
    {"reorder", ActionKind::reorder, Argument::none, true},
    {"length", ActionKind::length, Argument::length, true},
    {"answers", ActionKind::answers, Argument::change, true},
    {"garbage", ActionKind::garbage, Argument::octets, true},
    {"error", ActionKind::error, Argument::code, true},
    {"other-port", ActionKind::otherPort, Argument::none, true},
    {"flood", ActionKind::flood, Argument::count, true},
    {"late", ActionKind::late, Argument::none, true},
    {"gm", ActionKind::gm, Argument::onOff, false},
    {"clock-step", ActionKind::clockStep, Argument::seconds, false},
    {"stop-reading", ActionKind::stopReading, Argument::duration, false},
    {"exit", ActionKind::exit, Argument::status, false},
    {"unbind", ActionKind::unbind, Argument::none, false},
    {"rebind", ActionKind::rebind, Argument::none, false},
};

constexpr std::int64_t maxOctets = 65000;
constexpr std::int64_t maxPorts = 10000;

bool takeOnOff(ScriptWords& words) {
    if (words.accept("on")) {
        return true;
    }
    if (words.accept("off")) {
        return false;
    }
    throw ScriptError("expected on or off");
}

/// An integer of either meaning: with a sign it is a difference.
void takeChange(ScriptWords& words, const char* what, std::int64_t max, Action& action) {
    action.relative = words.nextHasSign();
    action.value = words.takeInteger(what, action.relative ? -max : 0, max);
}

void takeArgument(ScriptWords& words, Argument argument, Action& action) {
    switch (argument) {
    case Argument::none:
        break;
    case Argument::duration:
        action.value = words.takeDuration("time");
        break;
    case Argument::seconds:
        action.value = words.takeSeconds("time");
        break;
    case Argument::indexOrAll:
        action.value = words.accept("all") ? 0 : words.takeInteger("index", 1, maxPorts);
        break;
    case Argument::optionalIndex:
        action.value = words.atEnd() ? 0 : words.takeInteger("index", 1, maxPorts);
        break;
    case Argument::length:
        takeChange(words, "length", maxOctets, action);
        break;
    case Argument::change:
        takeChange(words, "number of answers", maxPorts, action);
        break;
    case Argument::octets:
        action.value = words.takeInteger("length", 0, maxOctets);
        break;
    case Argument::code:
        action.value = words.takeInteger("error code", 0, 65535);
        break;
    case Argument::count:
        action.value = words.takeInteger("count", 1, 10000);
        break;
    case Argument::onOff:
        action.value = takeOnOff(words) ? 1 : 0;
        break;
    case Argument::status:
        action.value = words.takeInteger("exit status", 0, 255);
        break;
    }
}

} // namespace

Action takeAction(ScriptWords& words, bool timed) {
    const std::string name = words.take("action");
    for (const ActionWord& entry : actionWords) {
        if (name != entry.word) {
            continue;
        }
        if (timed && entry.needsRequest) {
            throw ScriptError("action needs a request: " + name);
        }
        Action action;
        action.kind = entry.kind;
        takeArgument(words, entry.argument, action);
        return action;
    }
    throw ScriptError("unknown action: " + name);
}

} // namespace simptp4l
