#include "Health.h"

#include <algorithm>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Failure.h"
#include "QualityReasons.h"

namespace vantelhost {

namespace {

/// For how long no pair may come, in seconds.
double staleAfter(const HealthFacts& facts) {
    return std::max(1.0, 3 * facts.syncInterval);
}

bool isUsable(const HealthFacts& facts) {
    return facts.quality == "usable";
}

/// Whether a pair came, or may still come.
bool isFresh(const HealthFacts& facts, double now) {
    return now - (facts.pairs > 0 ? facts.pairTime : facts.usableSince) <= staleAfter(facts);
}

std::string reasonOf(const HealthFacts& facts) {
    if (facts.quality.empty()) {
        return "the plug-in has told no quality yet";
    }
    return facts.reason == roleHasChanged ? "no grandmaster is heard" : facts.reason;
}

struct Row {
    HealthState state;
    bool (*holds)(const HealthFacts& facts, double now);
    std::string (*reason)(const HealthFacts& facts);
};

constexpr Row rows[] = {
    {HealthState::stopping, [](const auto& facts, double) { return !facts.stopCause.empty(); },
     [](const auto& facts) { return facts.stopCause; }},
    {HealthState::dead, [](const auto& facts, double) { return !facts.daemonEnd.empty(); },
     [](const auto& facts) { return facts.daemonEnd; }},
    {HealthState::stale,
     [](const auto& facts, double now) { return isUsable(facts) && !isFresh(facts, now); },
     [](const auto& facts) {
         return fmt::format("the quality is usable, and no time pair came for more than {:.1f} s",
                            staleAfter(facts));
     }},
    {HealthState::starting,
     [](const auto& facts, double) { return isUsable(facts) && facts.pairs == 0; },
     [](const auto&) { return std::string("the first time pair is awaited"); }},
    {HealthState::unmeasured,
     [](const auto& facts, double) { return isUsable(facts) && !facts.pairIsMeasured; },
     [](const auto&) {
         return std::string("all offsets are exactly the same: ptp4l knows no delay yet, or never "
                            "will with this delayMechanism");
     }},
    {HealthState::locked, [](const auto& facts, double) { return isUsable(facts); },
     [](const auto&) { return std::string("time pairs arrive"); }},
    {HealthState::recovered,
     [](const auto& facts, double now) {
         return facts.reason == pollHasFailed && facts.pairs > 0 && isFresh(facts, now);
     },
     [](const auto&) {
         return std::string("time pairs arrive; the quality stays unusable until the next change "
                            "of role");
     }},
    {HealthState::starting,
     [](const auto& facts, double now) {
         return !facts.wasUsable && now - facts.begin <= facts.patience;
     },
     reasonOf},
    {HealthState::lost, [](const auto&, double) { return true; }, reasonOf},
};

} // namespace

const char* nameOf(HealthState state) {
    constexpr const char* names[] = {"starting",  "locked", "stale", "unmeasured",
                                     "recovered", "lost",   "dead",  "stopping"};
    return names[static_cast<std::size_t>(state)];
}

bool isGood(HealthState state) {
    return state == HealthState::locked || state == HealthState::recovered;
}

Health healthOf(const HealthFacts& facts, double now) {
    const auto& row = *std::find_if(std::begin(rows), std::end(rows),
                                    [&](const auto& each) { return each.holds(facts, now); });
    return {row.state, row.reason(facts)};
}

void HealthWatch::take(const Event& event, double seconds) {
    if (event.name == "quality") {
        takeQuality(event.members, seconds);
    } else if (event.name == "initialised") {
        facts_ = {};
        facts_.begin = seconds;
        facts_.patience = patienceFor(event.members["configuration"]);
        gaps_.clear();
    } else if (event.name == "daemon-ended") {
        facts_.daemonEnd = event.text;
    } else if (event.name == "stopping" && event.text != restartCause) {
        facts_.stopCause = event.text;
    }
}

void HealthWatch::takeQuality(const Json& members, double seconds) {
    const bool wasUsable = isUsable(facts_);
    facts_.quality = members["quality"];
    facts_.reason = members["reason"];
    if (isUsable(facts_) && !wasUsable) {
        facts_.wasUsable = true;
        facts_.usableSince = seconds;
    }
    // Told again and again while the epoch FIFO is missing: nothing begins anew then.
    if (!isUsable(facts_) || !wasUsable) {
        facts_.pairs = 0;
    }
    if (facts_.reason == daemonHasDied && facts_.daemonEnd.empty()) {
        facts_.daemonEnd = daemonHasDied;
    }
}

void HealthWatch::pair(PairKind kind, double seconds) {
    if (kind == PairKind::of1970) {
        return;
    }
    if (facts_.pairs > 0) {
        learn(seconds - facts_.pairTime);
    }
    ++facts_.pairs;
    facts_.pairTime = seconds;
    // What is left out for another reason is a measurement that came.
    facts_.pairIsMeasured = kind != PairKind::falseOffset;
}

/// The median: an outage does not count, nor a pair that was told late.
void HealthWatch::learn(double gap) {
    constexpr std::size_t most = 9;
    gaps_.push_back(gap);
    if (gaps_.size() > most) {
        gaps_.pop_front();
    }
    std::vector<double> sorted(gaps_.begin(), gaps_.end());
    const auto middle = sorted.begin() + static_cast<std::ptrdiff_t>((sorted.size() - 1) / 2);
    std::nth_element(sorted.begin(), middle, sorted.end());
    facts_.syncInterval = *middle;
}

Standing HealthWatch::standing(double now) const {
    return {health_, now - since_};
}

std::optional<Event> HealthWatch::change(double now) {
    const HealthState before = health_.state;
    health_ = healthOf(facts_, now);
    if (health_.state == before) {
        return std::nullopt;
    }
    const double spent = now - std::exchange(since_, now);
    return healthEvent(nameOf(health_.state), health_.reason, nameOf(before), spent);
}

} // namespace vantelhost
