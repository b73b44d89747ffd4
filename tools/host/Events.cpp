#include "Events.h"

#include <algorithm>
#include <array>
#include <cmath>

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <vantel_bc/quality.h>

#include "Text.h"

namespace vantelhost {

namespace {

using Quality = std::array<double, ZEKEL_QUALITY_LENGTH>;

const char* kindOf(const double* quality) {
    constexpr Quality usable = ZEKEL_QUALITY_USABLE;
    constexpr Quality unusable = ZEKEL_QUALITY_UNUSABLE;
    if (std::equal(usable.begin(), usable.end(), quality)) {
        return "usable";
    }
    return std::equal(unusable.begin(), unusable.end(), quality) ? "unusable" : "other";
}

std::string portSummary(const std::string& name, const Json& port) {
    return fmt::format("; {} {} on {}", name, shownMember(port, "portState"),
                       shownMember(port, "interface"));
}

/// The text of a status, as people read it.
std::string statusSummary(const Json& object) {
    std::string summary = fmt::format("{} at {}:{}", shownMember(object, "error_constant"),
                                      shownMember(object, "file"), shownMember(object, "line"));
    for (const char* key : {"additionalInfo", "std_exception_what", "zesync_debug"}) {
        if (object.contains(key)) {
            summary += ": " + shownMember(object, key);
        }
    }
    return summary;
}

std::string endText(const ChildEnd& end) {
    if (!end.bySignal) {
        return fmt::format("ended with status {}", end.status);
    }
    const char* const name = ::sigabbrev_np(end.status);
    return name == nullptr ? fmt::format("was ended by signal {}", end.status)
                           : fmt::format("was ended by SIG{}", name);
}

std::string offsetSummary(const Tally& tally) {
    if (tally.offsets.count == 0) {
        return "no offsets";
    }
    return fmt::format("offset min {} mean {:.1f} max {} rms {:.1f} ns", tally.offsets.smallest,
                       tally.offsets.mean(), tally.offsets.largest, tally.offsets.rms());
}

/// Behind the number of pairs; empty when none was left out.
std::string leftOutSummary(const Tally& tally) {
    std::uint64_t sum = 0;
    for (const auto& [word, count] : tally.leftOut) {
        sum += count;
    }
    return sum == 0 ? "" : fmt::format("{} left out, ", sum);
}

Json offsetMembers(const OffsetStatistics& offsets) {
    if (offsets.count == 0) {
        return nullptr;
    }
    return {{"min", offsets.smallest},
            {"mean", offsets.mean()},
            {"max", offsets.largest},
            {"rms", offsets.rms()}};
}

} // namespace

Event loadedEvent(const std::string& library, const std::string& name, std::uint32_t apiVersion) {
    return {"loaded",
            fmt::format("\"{}\", API version {}, {}", name, apiVersion, library),
            {{"name", name}, {"apiVersion", apiVersion}, {"library", library}}};
}

Event initialisedEvent(const Json& configuration) {
    return {"initialised", "interface " + toAscii(configuration["interface"]),
            Json{{"configuration", configuration}}};
}

Event startedEvent() {
    return {"started", "", Json::object()};
}

Event epochOffsetEvent(std::int64_t nanoseconds) {
    return {"epoch-offset", fmt::format("{} ns written", nanoseconds),
            Json{{"offset", nanoseconds}}};
}

Event qualityEvent(const double* quality, const std::string& reason) {
    const Quality values{quality[0], quality[1], quality[2]};
    const char* kind = kindOf(quality);
    return {"quality",
            fmt::format("{} [{}] {}", kind, fmt::join(values, ", "), reason),
            {{"quality", kind}, {"values", values}, {"reason", reason}}};
}

Event pairEvent(std::uint64_t reference, std::uint64_t local, std::int64_t offset, PairKind kind,
                const std::optional<Carried>& carried) {
    Event event{"pair",
                fmt::format("reference {} local {} offset {} ns", reference, local, offset),
                {{"reference", reference}, {"local", local}, {"offset", offset}}};
    if (kind != PairKind::measured) {
        event.text += fmt::format(", left out ({})", leftOutWord(kind));
        event.members["leftOut"] = leftOutWord(kind);
    }
    if (carried && carried->isOfOtherClock) {
        event.text +=
            fmt::format(", CLOCK_REALTIME {} +- {} ns", carried->realtime, carried->uncertainty);
        event.members["realtime"] = carried->realtime;
        event.members["uncertainty"] = carried->uncertainty;
    }
    return event;
}

Event metadataEvent(const Json& metadata) {
    std::string text = fmt::format("grandmaster {} class {} {}", shownMember(metadata, "gmClockId"),
                                   shownMember(metadata, "gmClockClass"),
                                   shownMember(metadata, "gmClockAccuracy"));
    std::string ports;
    for (const auto& [key, value] : metadata.items()) {
        if (value.is_object()) {
            ports += portSummary(key, value);
        }
    }
    text += ports.empty() ? "; no ports" : ports;
    return {"metadata", std::move(text), {{"valid", true}, {"metadata", metadata}}};
}

Event invalidMetadataEvent(const std::string& text) {
    return {"metadata", "invalid, not a JSON object: " + text, {{"valid", false}, {"text", text}}};
}

Event statusEvent(const std::string& operation, std::int32_t code, const std::string& json) {
    const Json object = Json::parse(json, nullptr, false);
    const bool valid = object.is_object();
    std::string text = fmt::format("{}: code {}", operation, code);
    if (!json.empty()) {
        text += ", " + (valid ? statusSummary(object) : json);
    }
    return {code < 0 ? "error" : "warning",
            std::move(text),
            {{"operation", operation}, {"code", code}, {"status", valid ? object : Json(json)}}};
}

Event failureEvent(const std::string& operation, const std::string& problem) {
    return {"error", operation + ": " + problem, {{"operation", operation}, {"problem", problem}}};
}

Event refusedEvent(const std::string& function) {
    return {"refused", function + ": the host is stopping", Json{{"function", function}}};
}

Event clockEvent(const std::string& clock, const std::string& problem, std::uint64_t refused) {
    std::string text = "local times are those of " + clock;
    text += problem.empty() ? "" : ", not as they should: " + problem;
    text += refused == 0 ? "" : fmt::format("; {} pairs were not, and are refused", refused);
    return {
        "clock", std::move(text), {{"clock", clock}, {"problem", problem}, {"refused", refused}}};
}

Event chronyEvent(const ChronyCounts& counts, const std::string& problem) {
    const bool reachable = problem.empty();
    std::string text = reachable ? "takes the pairs" : "does not take the pairs: " + problem;
    text += fmt::format("; {} sent, {} failed", counts.sent, counts.failed);
    text += counts.withheld == 0 ? "" : fmt::format(", {} withheld", counts.withheld);
    return {"chrony",
            std::move(text),
            {{"reachable", reachable},
             {"sent", counts.sent},
             {"failed", counts.failed},
             {"withheld", counts.withheld},
             {"problem", problem}}};
}

Event statusSocketEvent(const std::string& path, const std::string& problem) {
    return {"status-socket",
            fmt::format("{}: {}; tried again", path, problem),
            {{"path", path}, {"problem", problem}}};
}

Event lostEvent(const std::string& output, std::uint64_t events, double seconds,
                const std::string& problem) {
    return {"lost",
            fmt::format("{}: {} events in {:.3f} s: {}; it is written again", output, events,
                        seconds, problem),
            {{"output", output}, {"events", events}, {"seconds", seconds}, {"problem", problem}}};
}

Event metricsEvent(const std::string& address, const std::string& problem) {
    const bool listening = problem.empty();
    std::string text = listening
                           ? "served at " + address
                           : fmt::format("not served at {}: {}; tried again", address, problem);
    return {"metrics",
            std::move(text),
            {{"listening", listening}, {"address", address}, {"problem", problem}}};
}

Event folderEvent(const std::string& path) {
    return {"folder", fmt::format("{} made", path), Json{{"path", path}}};
}

Event expectedEvent(const Event& event) {
    Json members{{"call", event.name}};
    members.update(event.members);
    return {"expected", fmt::format("{} {}", event.name, event.text), std::move(members)};
}

Event daemonEndedEvent(const ChildEnd& end, const std::deque<std::string>& words) {
    std::string text = fmt::format("ptp4l, process {}, {}", end.pid, endText(end));
    text += words.empty() ? ", without a word"
                          : fmt::format("; its last words: {}", fmt::join(words, " / "));
    return {"daemon-ended",
            std::move(text),
            {{"pid", end.pid}, {end.bySignal ? "signal" : "status", end.status}, {"words", words}}};
}

Event causeEvent(const std::string& cause) {
    return {"cause", cause, Json{{"text", cause}}};
}

Event mendEvent(const std::string& mend) {
    return {"mend", mend, Json{{"text", mend}}};
}

Event healthEvent(const std::string& state, const std::string& reason, const std::string& before,
                  double spent) {
    return {"health",
            fmt::format("{}, {}; before: {} for {:.1f} s", state, reason, before, spent),
            {{"state", state},
             {"reason", reason},
             {"before", before},
             {"spent", std::round(spent * 1e3) / 1e3}}};
}

Event restartEvent(const std::string& cause, double delay, std::uint64_t restarts) {
    return {"restart",
            fmt::format("{}; the next session begins in {:.0f} s", cause, delay),
            {{"cause", cause}, {"delay", delay}, {"restarts", restarts}}};
}

Event stoppingEvent(const std::string& cause) {
    return {"stopping", cause, Json{{"cause", cause}}};
}

Event stoppedEvent() {
    return {"stopped", "", Json::object()};
}

Event summaryEvent(double seconds, const Tally& tally) {
    std::string text =
        fmt::format("{:.3f} s, {} pairs, {}{} quality changes, {} metadata updates, {} errors, {}",
                    seconds, tally.offsets.count, leftOutSummary(tally), tally.qualityChanges,
                    tally.metadataUpdates, tally.errors, offsetSummary(tally));
    return {"summary",
            std::move(text),
            {{"duration", seconds},
             {"pairs", tally.offsets.count},
             {"leftOut", tally.leftOut},
             {"qualityChanges", tally.qualityChanges},
             {"metadataUpdates", tally.metadataUpdates},
             {"timeRequests", tally.timeRequests},
             {"refused", tally.refused},
             {"errors", tally.errors},
             {"offset", offsetMembers(tally.offsets)}}};
}

} // namespace vantelhost
