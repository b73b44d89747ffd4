#include "Status/StatusPage.h"

#include <algorithm>
#include <cmath>

namespace vantelhost {

namespace {

double toMilliseconds(double seconds) {
    return std::round(seconds * 1e3) / 1e3;
}

Json statisticsOf(const OffsetWindow& window, double now) {
    const OffsetStatistics offsets = window.statistics(now);
    if (offsets.count == 0) {
        return nullptr;
    }
    return {{"pairs", offsets.count},
            {"rms", offsets.rms()},
            {"min", offsets.smallest},
            {"max", offsets.largest}};
}

Json portsOf(const Json& metadata) {
    Json ports = Json::object();
    for (const auto& [name, member] : metadata.items()) {
        if (member.is_object()) {
            ports[name] = member;
        }
    }
    return ports;
}

/// The metadata's members without the ports.
Json clocksOf(const Json& metadata) {
    Json clocks = Json::object();
    for (const auto& [name, member] : metadata.items()) {
        if (!member.is_object()) {
            clocks[name] = member;
        }
    }
    return clocks;
}

} // namespace

void StatusPage::take(const Event& event, const Moment& moment) {
    const std::lock_guard lock(mutex_);
    update(state_.view, event, moment.seconds);
    if (event.name == "chrony") {
        state_.chronyProblem = event.members["problem"];
    }
    if (event.name != "pair") {
        return;
    }
    if (event.members.contains("leftOut")) {
        return;
    }
    const std::int64_t offset = event.members["offset"];
    state_.minute.add(moment.seconds, offset);
    state_.hour.add(moment.seconds, offset);
}

void StatusPage::takeChrony(const ChronyCounts& counts) {
    const std::lock_guard lock(mutex_);
    state_.chrony = counts;
}

Json StatusPage::at(double now) const {
    // Copied, so that whoever asks does not hold up the time pairs.
    const State state = [this] {
        const std::lock_guard lock(mutex_);
        return state_;
    }();
    const ViewState& view = state.view;
    Json last;
    if (view.offset) {
        last = {{"offset", *view.offset}, {"age", toMilliseconds(now - view.offsetSeconds)}};
    }
    Json chrony;
    if (state.chrony) {
        chrony = {{"problem", state.chronyProblem},
                  {"sent", state.chrony->sent},
                  {"failed", state.chrony->failed},
                  {"withheld", state.chrony->withheld}};
    }
    return {{"health", view.health},
            {"reason", view.healthReason},
            {"since", toMilliseconds(now - view.healthSince)},
            {"plugIn", view.plugIn},
            {"uptime", toMilliseconds(now)},
            {"restarts", view.restarts},
            {"quality", view.quality},
            {"qualityReason", view.reason},
            {"clocks", clocksOf(view.metadata)},
            {"ports", portsOf(view.metadata)},
            {"last", last},
            {"minute", statisticsOf(state.minute, now)},
            {"hour", statisticsOf(state.hour, now)},
            {"pairs", view.allOffsets.count},
            {"leftOut", view.leftOut},
            {"chrony", chrony}};
}

} // namespace vantelhost
