/// @file
#pragma once

#include <cstdint>
#include <deque>
#include <optional>
#include <string>

#include "Events.h"
#include "Json.h"

namespace vantelhost {

enum class HealthState {
    starting,   ///< not usable yet, and young; or usable, and the first time pair is awaited
    locked,     ///< usable, and time pairs arrive
    stale,      ///< usable, and none arrives any more
    unmeasured, ///< usable, pairs arrive, and ptp4l knows no delay: they say nothing
    recovered,  ///< pairs arrive, though the last quality is that of a failed poll
    lost,       ///< unusable
    dead,       ///< ptp4l has ended
    stopping    ///< the host was asked to end
};

constexpr HealthState allHealthStates[] = {
    HealthState::starting,  HealthState::locked, HealthState::stale, HealthState::unmeasured,
    HealthState::recovered, HealthState::lost,   HealthState::dead,  HealthState::stopping};

/// Its word.
const char* nameOf(HealthState state);

/// Whether a clock may follow the pairs that come. Also when it has recovered: ptp4l answers again,
/// and a clock that waited for the next change of role might wait for months.
bool isGood(HealthState state);

struct Health {
    HealthState state;
    std::string reason; ///< for people
};

/// What a session has told, as far as its health depends on it. Times are seconds of one clock that
/// is never set.
struct HealthFacts {
    double begin = 0;      ///< of the session
    double patience = 13;  ///< how long it may take to become usable, in seconds
    std::string stopCause; ///< why the host ends; empty until it does
    std::string daemonEnd; ///< how ptp4l ended; empty while it runs
    std::string quality;   ///< "usable" or another one; empty until there is one
    std::string reason;
    bool wasUsable = false;
    double usableSince = 0;  ///< the last time that it became usable
    std::uint64_t pairs = 0; ///< since then, or since the quality was told; without those of 1970
    double pairTime = 0;     ///< when the last one came
    bool pairIsMeasured = true; ///< the last one
    double syncInterval = 1;    ///< as learnt, in seconds; that of the default profile until then
};

/// The first row of a table that holds.
Health healthOf(const HealthFacts& facts, double now);

/// A health that has lasted for so many seconds.
struct Standing {
    Health health;
    double seconds = 0;
};

/// Gathers the facts of a run from its events. Knows nothing of threads.
class HealthWatch {
public:
    /// Any event but a time pair.
    /// @param seconds when it happened, never before the last one
    void take(const Event& event, double seconds);

    /// A time pair. As above.
    void pair(PairKind kind, double seconds);

    /// Whether the state is another than at the last call: then it has changed now.
    /// @return the event that tells so.
    std::optional<Event> change(double now);

    /// As of now, whether it was told or not.
    HealthState state(double now) const { return healthOf(facts_, now).state; }

    /// As of the last call of change().
    Standing standing(double now) const;

private:
    void takeQuality(const Json& members, double seconds);
    void learn(double gap);

    HealthFacts facts_;
    std::deque<double> gaps_; ///< the last ones between pairs, in seconds
    Health health_{HealthState::starting, {}};
    double since_ = 0;
};

} // namespace vantelhost
