#include "ScriptParser.h"

#include "Answer.h"
#include "DataSets.h"
#include "ScriptActions.h"
#include "ScriptWords.h"

#include <csignal>

namespace simptp4l {
namespace {

constexpr std::int64_t maxPort = 65535;
constexpr std::int64_t maxCount = INT64_MAX;

/// Numbers that a clock may add up stay far from the ends of their range.
constexpr std::int64_t maxTime = INT64_C(4000000000000000000);

unsigned takePort(ScriptWords& words) {
    return static_cast<unsigned>(words.takeInteger("port", 1, maxPort));
}

void takeOffset(ScriptWords& words, Script& script) {
    script.offset = words.takeInteger("offset", -maxTime, maxTime);
}

void takeDrift(ScriptWords& words, Script& script) {
    script.driftPpb = words.takeNumber("drift");
    if (script.driftPpb < -1e9 || script.driftPpb > 1e9) {
        throw ScriptError("drift beyond 1e9 ppb");
    }
}

void takeJitter(ScriptWords& words, Script& script) {
    script.jitter = words.takeInteger("jitter", 0, 1000000000000);
}

void takeSeed(ScriptWords& words, Script& script) {
    script.seed = words.takeRaw("seed", 8);
}

void takeSyncInterval(ScriptWords& words, Script& script) {
    const std::int64_t interval = words.takeDuration("interval");
    if (interval == 0) {
        throw ScriptError("interval must not be 0");
    }
    script.syncInterval = interval;
}

void takeSyncsBeforeDelay(ScriptWords& words, Script& script) {
    script.syncsBeforeDelay =
        words.accept("all") ? UINT64_MAX
                            : static_cast<std::uint64_t>(words.takeInteger("count", 0, maxCount));
}

void takeClock(ScriptWords& words, Script& script) {
    const std::string source = words.take("clock");
    if (source == "realtime") {
        script.clock = ClockSource::realtime;
    } else if (source == "monotonic") {
        script.clock = ClockSource::monotonic;
    } else if (source == "fixed") {
        script.fixedTime = words.takeInteger("time", -maxTime, maxTime);
        script.clock = ClockSource::fixed;
    } else if (source == "steered") {
        script.steeredFile = words.take("path");
        script.clock = ClockSource::steered;
    } else {
        throw ScriptError("unknown clock: " + source);
    }
}

void takeClockOffset(ScriptWords& words, Script& script) {
    script.clockOffset = words.takeSeconds("offset");
}

void takeGm(ScriptWords& words, Script& script) {
    script.gmPresent = words.accept("present");
    if (!script.gmPresent && !words.accept("absent")) {
        throw ScriptError("expected present or absent");
    }
}

void takeGmAfter(ScriptWords& words, Script& script) {
    script.gmAfter = words.takeDuration("time");
}

void takeGmIdentity(ScriptWords& words, Script& script) {
    script.gmIdentity = words.takeIdentity("identity");
}

void takeClockIdentity(ScriptWords& words, Script& script) {
    script.clockIdentity = words.takeIdentity("identity");
}

void takePorts(ScriptWords& words, Script& script) {
    script.ports = static_cast<unsigned>(words.takeInteger("number of ports", 0, 10000));
}

void takeInterfaceName(ScriptWords& words, Script& script) {
    const unsigned port = takePort(words);
    const std::string name = words.take("interface name");
    if (name.size() > 255) {
        throw ScriptError("interface name beyond 255 octets");
    }
    script.interfaceNames[port] = name;
}

void takePortState(ScriptWords& words, Script& script) {
    const unsigned port = takePort(words);
    script.portStates[port] = static_cast<std::uint8_t>(words.takeInteger("port state", 0, 255));
}

bool takeStrict(ScriptWords& words) {
    const bool strict = words.accept("strict");
    if (!strict && !words.accept("lenient")) {
        throw ScriptError("expected strict or lenient");
    }
    return strict;
}

void takePadding(ScriptWords& words, Script& script) {
    script.strictPadding = takeStrict(words);
}

void takeFollowUpInfo(ScriptWords& words, Script& script) {
    script.strictFollowUpInfo = takeStrict(words);
}

void takeLog(ScriptWords& words, Script& script) {
    script.log = words.take("path");
}

void takeIgnore(ScriptWords& words, Script& script) {
    const std::string name = words.take("signal");
    if (name != "SIGTERM" && name != "SIGINT") {
        throw ScriptError("expected SIGTERM or SIGINT");
    }
    script.ignoredSignals.push_back(name == "SIGTERM" ? SIGTERM : SIGINT);
}

void takeExitAtOnce(ScriptWords& words, Script& script) {
    script.exitAtOnce = static_cast<int>(words.takeInteger("exit status", 0, 255));
}

void takeStartDelay(ScriptWords& words, Script& script) {
    script.startDelay = words.takeDuration("time");
}

/// The width of a field that `set` names; throws when there is none.
unsigned widthOf(const std::string& message, const std::string& field) {
    const DataSet* dataSet = findDataSet(message);
    if (dataSet == nullptr && message != "HEADER") {
        throw ScriptError("unknown data set: " + message);
    }
    for (const Field& entry : dataSet != nullptr ? dataSet->tlv(View{}) : headerFields({}, 0)) {
        if (entry.name == field) {
            return entry.width;
        }
    }
    throw ScriptError("unknown field: " + message + "." + field);
}

void takeSet(ScriptWords& words, Script& script) {
    const std::string name = words.take("field");
    const std::size_t dot = name.find('.');
    if (dot == std::string::npos) {
        throw ScriptError("expected DATA_SET.FIELD: " + name);
    }
    Override item;
    item.message = name.substr(0, dot);
    item.field = name.substr(dot + 1);
    item.value = words.takeRaw("value", widthOf(item.message, item.field));
    if (words.accept("port")) {
        item.port = static_cast<unsigned>(words.takeInteger("port", 0, maxPort));
    }
    script.overrides.push_back(item);
}

void takeOn(ScriptWords& words, Script& script) {
    Rule rule;
    const std::string selector = words.take("selector");
    const DataSet* dataSet = findDataSet(selector);
    if (dataSet != nullptr) {
        rule.managementId = dataSet->id;
    } else if (selector != "any") {
        throw ScriptError("unknown selector: " + selector);
    }
    if (words.accept("from")) {
        rule.from = words.takeDuration("time");
    }
    if (words.accept("until")) {
        rule.until = words.takeDuration("time");
    }
    if (words.accept("after")) {
        rule.after = static_cast<std::uint64_t>(words.takeInteger("count", 0, maxCount));
    }
    if (words.accept("times")) {
        rule.times = static_cast<std::uint64_t>(words.takeInteger("count", 0, maxCount));
    }
    if (!words.accept("do")) {
        throw ScriptError("expected do, after [from T] [until T] [after COUNT] [times COUNT]");
    }
    rule.action = takeAction(words, false);
    script.rules.push_back(rule);
}

void takeAt(ScriptWords& words, Script& script) {
    TimedAction timed;
    timed.time = words.takeDuration("time");
    if (!words.accept("do")) {
        throw ScriptError("expected do");
    }
    timed.action = takeAction(words, true);
    script.timedActions.push_back(timed);
}

struct LineWord {
    const char* word;
    void (*take)(ScriptWords&, Script&);
};

constexpr LineWord lineWords[] = {
    {"offset", takeOffset},
    {"drift-ppb", takeDrift},
    {"jitter", takeJitter},
    {"seed", takeSeed},
    {"sync-interval", takeSyncInterval},
    {"syncs-before-delay", takeSyncsBeforeDelay},
    {"clock", takeClock},
    {"clock-offset", takeClockOffset},
    {"gm", takeGm},
    {"gm-after", takeGmAfter},
    {"gm-identity", takeGmIdentity},
    {"clock-identity", takeClockIdentity},
    {"ports", takePorts},
    {"interface-name", takeInterfaceName},
    {"port-state", takePortState},
    {"padding", takePadding},
    {"follow-up-info", takeFollowUpInfo},
    {"log", takeLog},
    {"ignore", takeIgnore},
    {"exit-at-once", takeExitAtOnce},
    {"start-delay", takeStartDelay},
    {"set", takeSet},
    {"on", takeOn},
    {"at", takeAt},
};

void parseLine(const std::string& line, Script& script) {
    ScriptWords words(line);
    if (words.atEnd()) {
        return;
    }
    const std::string name = words.take("word");
    for (const LineWord& entry : lineWords) {
        if (name != entry.word) {
            continue;
        }
        Script changed = script;
        entry.take(words, changed);
        words.expectEnd();
        script = changed;
        return;
    }
    throw ScriptError("unknown word: " + name);
}

} // namespace

Script parseScript(std::istream& input, std::vector<LineError>& errors) {
    Script script;
    std::string line;
    for (unsigned number = 1; std::getline(input, line); ++number) {
        try {
            parseLine(line, script);
        } catch (const ScriptError& error) {
            errors.push_back({number, error.what()});
        }
    }
    return script;
}

} // namespace simptp4l
