/// @file
#pragma once

#include <optional>
#include <string>

#include "Json.h"
#include "Tally.h"

namespace vantelhost {

/// What is known of a run at its end.
struct RunFacts {
    double seconds = 0;  ///< from the start to the stop
    double patience = 0; ///< in which a time pair is to come, in seconds
    Tally tally;
    std::string daemonEnd;  ///< how ptp4l ended before it was asked to; empty when it did not
    std::string daemonMend; ///< what to do about that; empty when it is not known
    std::string fifo;       ///< the path of the epoch FIFO
    bool fifoIsThere = true;
    std::string chronyFailure; ///< that of a chronyd that took no pair; else empty
};

/// Why a run that seemed to go well was in vain.
struct Failure {
    std::string cause;
    std::string mend; ///< what to do about it
};

/// How long a sound clock may need for its first time pair, in seconds: 5 s, for ptp4l and the poll
/// that it does not answer, and four Announce intervals, until a grandmaster is chosen.
double patienceFor(const Json& settings);

/// The first cause that explains the others; nothing when time pairs came that are of use.
std::optional<Failure> failureOf(const RunFacts& facts);

} // namespace vantelhost
