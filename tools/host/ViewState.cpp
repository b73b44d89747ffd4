#include "ViewState.h"

namespace vantelhost {

namespace {

constexpr std::size_t mostProblems = 5;

void addProblem(ViewState& state, double seconds, const std::string& text) {
    auto& problems = state.problems;
    if (!problems.empty() && problems.back().text == text) {
        problems.back().seconds = seconds;
        ++problems.back().times;
        return;
    }
    problems.push_back({seconds, text});
    if (problems.size() > mostProblems) {
        problems.pop_front();
    }
}

void updateQuality(ViewState& state, const Json& members, double seconds) {
    const std::string quality = members["quality"];
    const std::string reason = members["reason"];
    // What is told then follows from it.
    if (!state.daemonEnd.empty() && quality == state.quality) {
        return;
    }
    if (quality != state.quality || reason != state.reason) {
        state.quality = quality;
        state.reason = reason;
        state.qualitySince = seconds;
    }
    // The one in start only says that there is nothing yet.
    if (state.started && quality != "usable") {
        addProblem(state, seconds, quality + ": " + reason);
    }
}

void updatePair(ViewState& state, const Json& members, double seconds) {
    if (const auto leftOut = members.find("leftOut"); leftOut != members.end()) {
        ++state.leftOut[*leftOut];
    }
    const std::int64_t offset = members["offset"];
    state.offset = offset;
    state.offsetSeconds = seconds;
    state.allOffsets.add(offset);
    state.offsets.add(seconds, offset);
}

/// A session begins anew: what the last one told of its daemon is over.
void updateRestart(ViewState& state, const Event& event) {
    state.phase = "restarting";
    state.started = false;
    state.restarts = event.members["restarts"];
    state.quality.clear();
    state.reason.clear();
    state.daemonEnd.clear();
    state.metadata = Json::object();
}

void updateHealth(ViewState& state, const Json& members, double seconds) {
    state.health = members["state"];
    state.healthReason = members["reason"];
    state.healthSince = seconds;
}

void updateMetadata(ViewState& state, const Event& event, double seconds) {
    if (event.members["valid"]) {
        state.metadata = event.members["metadata"];
    } else {
        addProblem(state, seconds, "metadata: " + event.text);
    }
}

} // namespace

void update(ViewState& state, const Event& event, double seconds) {
    const Json& members = event.members;
    if (event.name == "loaded") {
        state.plugIn = members["name"];
    } else if (event.name == "started") {
        state.started = true;
        state.phase = "running";
    } else if (event.name == "stopping") {
        state.phase = "stopping (" + event.text + ")";
    } else if (event.name == "stopped") {
        state.phase = "stopped";
    } else if (event.name == "quality") {
        updateQuality(state, members, seconds);
    } else if (event.name == "pair") {
        updatePair(state, members, seconds);
    } else if (event.name == "health") {
        updateHealth(state, members, seconds);
    } else if (event.name == "restart") {
        updateRestart(state, event);
    } else if (event.name == "metadata") {
        updateMetadata(state, event, seconds);
    } else if (event.name == "chrony") {
        state.chrony = event.text;
    } else if (event.name == "daemon-ended") {
        state.daemonEnd = event.text;
        addProblem(state, seconds, event.text);
    } else if (event.name == "metrics" && !members["listening"].get<bool>()) {
        addProblem(state, seconds, "metrics " + event.text);
    } else if (event.name == "reread" && !members["problems"].empty()) {
        addProblem(state, seconds, "configuration: " + event.text);
    } else if (event.name == "status-socket" || event.name == "lost") {
        addProblem(state, seconds, event.name + " " + event.text);
    } else if (event.name == "error" || event.name == "warning" || event.name == "refused") {
        addProblem(state, seconds, event.text);
    }
}

} // namespace vantelhost
