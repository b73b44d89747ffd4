#include "Metrics/MetricSink.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string_view>
#include <unordered_map>
#include <utility>

#include "QualityReasons.h"
#include "Text.h"

namespace vantelhost {

namespace {

/// In the order of their numbers.
constexpr std::array<std::string_view, 11> portStates = {
    "",
    "PTP_INITIALIZING",
    "PTP_FAULTY",
    "PTP_DISABLED",
    "PTP_LISTENING",
    "PTP_PRE_MASTER",
    "PTP_MASTER",
    "PTP_PASSIVE",
    "PTP_UNCALIBRATED",
    "PTP_SLAVE",
    "PTP_GRAND_MASTER",
};

/// Its number; 0 for a name that is not known.
int portState(std::string_view name) {
    const auto* const found = std::find(portStates.begin(), portStates.end(), name);
    return found == portStates.end() ? 0 : static_cast<int>(found - portStates.begin());
}

void increase(std::atomic<std::uint64_t>& count) {
    count.fetch_add(1, std::memory_order_relaxed);
}

/// A string; empty when there is none.
std::string_view text(const Json& object, const char* key) {
    const auto found = object.find(key);
    return found != object.end() && found->is_string() ? found->get_ref<const std::string&>()
                                                       : std::string_view();
}

/// As a label: numbers in digits.
std::string label(const Json& value) {
    if (value.is_number_integer()) {
        return std::to_string(value.get<std::int64_t>());
    }
    return value.is_string() ? value.get<std::string>() : toAscii(value);
}

void takeGrandmasterMember(GrandmasterLabels& labels, std::string_view name, const Json& value) {
    static constexpr std::pair<std::string_view, std::string GrandmasterLabels::*> members[] = {
        {"gmClockId", &GrandmasterLabels::identity},
        {"gmClockClass", &GrandmasterLabels::clockClass},
        {"gmClockAccuracy", &GrandmasterLabels::accuracy},
        {"gmPriority1", &GrandmasterLabels::priority1},
        {"gmPriority2", &GrandmasterLabels::priority2}};
    for (const auto& [key, member] : members) {
        if (name == key) {
            labels.*member = label(value);
        }
    }
}

/// @param name "Port" and its number
PortLabels portLabels(const std::string& name, const Json& port) {
    constexpr std::string_view prefix = "Port";
    const bool hasPrefix = name.compare(0, prefix.size(), prefix) == 0;
    return {hasPrefix ? name.substr(prefix.size()) : name, std::string(text(port, "interface")),
            portState(text(port, "portState"))};
}

/// In one pass: to look for each member by its name takes longer than all else.
ClockLabels clockLabels(const Json& metadata) {
    ClockLabels labels;
    for (const auto& [name, value] : metadata.get_ref<const Json::object_t&>()) {
        if (value.is_object()) {
            labels.ports.push_back(portLabels(name, value));
        } else {
            takeGrandmasterMember(labels.grandmaster, name, value);
        }
    }
    return labels;
}

} // namespace

void MetricSink::take(const Event& event, const Moment& moment) {
    using Taker = void (MetricSink::*)(const Event&, const Moment&);
    static const std::unordered_map<std::string, Taker> takers{
        {"pair", &MetricSink::takePair},         {"quality", &MetricSink::takeQuality},
        {"metadata", &MetricSink::takeMetadata}, {"health", &MetricSink::takeHealth},
        {"restart", &MetricSink::takeRestart},   {"epoch-offset", &MetricSink::takeEpochOffset},
        {"error", &MetricSink::takeError}};
    const auto taker = takers.find(event.name);
    if (taker != takers.end()) {
        (this->*taker->second)(event, moment);
    }
}

void MetricSink::takeHealth(const Event& event, const Moment& /*moment*/) {
    const std::string_view state = text(event.members, "state");
    for (const HealthState each : allHealthStates) {
        if (state == nameOf(each)) {
            values_.health = each;
        }
    }
    increase(values_.healthChanges);
}

void MetricSink::takeRestart(const Event& /*event*/, const Moment& /*moment*/) {
    increase(values_.restarts);
    values_.clocks.set({});
}

void MetricSink::takeEpochOffset(const Event& event, const Moment& /*moment*/) {
    epochOffset_ = static_cast<std::uint64_t>(event.members["offset"].get<std::int64_t>());
}

void MetricSink::takeQuality(const Event& event, const Moment& /*moment*/) {
    const auto& quality = event.members["quality"].get_ref<const std::string&>();
    const auto& reason = event.members["reason"].get_ref<const std::string&>();
    if (reason == pollHasFailed) {
        increase(values_.failedPolls);
    }
    if (quality == quality_ && reason == reason_) {
        return;
    }
    quality_ = quality;
    reason_ = reason;
    values_.quality.set({quality, isUtf8(reason) ? reason : toAscii(reason)});
}

void MetricSink::takePair(const Event& event, const Moment& moment) {
    const Json& members = event.members;
    increase(values_.pairs);
    values_.lastPair = moment.seconds;
    const auto leftOut = members.find("leftOut");
    if (leftOut == members.end() || *leftOut != leftOutWord(PairKind::of1970)) {
        const auto carried = members.find("realtime");
        countPollDelay(carried != members.end()
                           ? carried->get<std::uint64_t>()
                           : members["local"].get<std::uint64_t>() - epochOffset_,
                       moment.realtime);
    }
    if (leftOut != members.end()) {
        countLeftOut(leftOut->get_ref<const std::string&>());
        return;
    }
    const auto offset = members["offset"].get<std::int64_t>();
    values_.offset = offset;
    values_.hasOffset = true;
    values_.offsets.count(std::abs(static_cast<double>(offset)) * 1e-9);
}

void MetricSink::countLeftOut(std::string_view word) {
    const auto* const kind =
        std::find(std::begin(leftOutKinds), std::end(leftOutKinds), kindOfWord(word));
    increase(values_.pairsLeftOut.at(static_cast<std::size_t>(kind - leftOutKinds)));
}

void MetricSink::countPollDelay(std::uint64_t ingress, std::uint64_t now) {
    const auto delay = static_cast<std::int64_t>(now - ingress);
    // Below 0 the ingress time is of another clock than the host's, and it tells nothing.
    if (delay >= 0) {
        values_.pollDelays.count(static_cast<double>(delay) * 1e-9);
    }
}

void MetricSink::takeMetadata(const Event& event, const Moment& /*moment*/) {
    if (!event.members["valid"].get<bool>()) {
        increase(values_.hostCallErrors);
        increase(values_.errors);
        return;
    }
    const Json& metadata = event.members["metadata"];
    ClockLabels labels = clockLabels(metadata);
    // Metadata without a port are those of a failed poll: nobody knows the grandmaster then.
    if (labels.ports.empty()) {
        values_.clocks.set({});
        return;
    }
    takeGrandmaster(labels.grandmaster.identity, text(metadata, "localClockId"));
    values_.clocks.set(std::move(labels));
}

void MetricSink::takeGrandmaster(const std::string& identity, std::string_view ownIdentity) {
    if (identity == ownIdentity || identity == grandmaster_) {
        return;
    }
    if (!grandmaster_.empty()) {
        increase(values_.grandmasterChanges);
    }
    grandmaster_ = identity;
}

void MetricSink::takeError(const Event& event, const Moment& /*moment*/) {
    increase(values_.errors);
    if (text(event.members, "operation").compare(0, 6, "zekel_") == 0) {
        increase(values_.hostCallErrors);
    }
}

} // namespace vantelhost
