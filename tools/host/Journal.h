/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "Clock/PairCarrier.h"
#include "Events.h"
#include "Health.h"
#include "Moment.h"
#include "PairTrust.h"
#include "Tally.h"

namespace vantelhost {

/// Takes one event.
/// @return false when it is lost; errno says why.
using EventSink = std::function<bool(const Event&, const Moment&)>;

/// Takes a time pair, in nanoseconds; the local time is of CLOCK_REALTIME.
/// @return an event, if there is something to tell.
using PairTaker = std::function<std::optional<Event>(std::uint64_t reference, std::uint64_t local)>;

/// Carries the local time of a pair over to CLOCK_REALTIME: see PairCarrier.
using LocalCarrier = std::function<PairCarrier::Result(std::uint64_t local)>;

/// Takes one event, and sees itself to what it cannot take.
/// @return an event, if there is something to tell.
using EventTaker = std::function<std::optional<Event>(const Event&, const Moment&)>;

/// Takes everything that happens in a run, passes it on and sums it up. Thread-safe: events come
/// out in the order in which they are counted.
///
/// When the output loses an event it gets no more, and the others are told: an error. So is told
/// what one of these has to tell.
class Journal {
public:
    /// @param onLostOutput called once when this output loses an event, with the reason.
    /// @param begin        the moments of events are counted from then.
    Journal(EventSink output, std::function<void(const std::string&)> onLostOutput,
            Moment::Clock::time_point begin = Moment::Clock::now());

    /// One more output, which also gets what has come so far. To be called before other threads use
    /// the journal, as the next three.
    void addOutput(EventTaker output);

    /// There will be no more outputs: what has come so far need not be kept.
    void outputsAreComplete();

    /// Who gets besides the time pairs that a clock may follow: those that are neither left out nor
    /// refused.
    void handPairsTo(PairTaker taker);

    /// How local times are carried over to CLOCK_REALTIME. Without, they are taken as of that.
    void carryPairsBy(LocalCarrier carrier);

    /// Something without a count.
    void note(const Event& event);

    /// Something that makes the run unclean.
    void error(const Event& event);

    /// @param quality  ZEKEL_QUALITY_LENGTH doubles
    /// @param expected it only says that a signal ends the run: neither counted nor news.
    void quality(const double* quality, const std::string& reason, bool expected = false);
    void pair(std::uint64_t reference, std::uint64_t local);

    /// A text that is not a JSON object is an error.
    /// @param expected as above
    void metadata(const std::string& text, bool expected = false);

    void timeRequest();

    /// A call of this function was refused because the host is stopping.
    void refusal(const std::string& function);

    /// To be called now and then: the health also changes when nothing happens.
    void turn();

    /// For how long which health has lasted.
    Standing health() const;

    /// How long ago a call of the plug-in was taken, whatever it had to say, in seconds.
    double sinceLastCall() const;

    void summary();

    /// Whether there was no error and no lost output.
    bool isClean() const;

    Tally tally() const;

private:
    void print(const Event& event);

    /// What a time pair is, or that the health is not what it should be.
    PairKind judge(std::uint64_t local, std::int64_t offset, const Moment& moment);

    /// What the time pairs to come are judged by.
    void tellTrust(const Event& event);
    void tellHealth(const Moment& moment);

    /// Pairs of 1970 have no time.
    PairCarrier::Result carry(PairKind kind, std::uint64_t local) const;
    void pass(const Event& event, const Moment& moment);
    void tell(const std::vector<Event>& news, const Moment& moment);

    mutable std::mutex mutex_;
    const Moment::Clock::time_point begin_;
    std::vector<EventTaker> outputs_;
    std::optional<std::vector<std::pair<Event, Moment>>> early_{std::in_place};
    PairTaker pairTaker_;
    LocalCarrier carrier_;
    PairTrust trust_;
    HealthWatch health_;
    Moment::Clock::time_point lastCall_ = Moment::Clock::now();
    std::string lastQuality_;
    Tally tally_;
};

} // namespace vantelhost
