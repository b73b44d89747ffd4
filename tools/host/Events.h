/// @file
/// What the host tells about a run: each event as a line for people and as members for programs.
#pragma once

#include <cstdint>
#include <deque>
#include <optional>
#include <string>

#include "Clock/Carried.h"
#include "Json.h"
#include "PairKind.h"
#include "Signals.h"
#include "Tally.h"

namespace vantelhost {

struct Event {
    std::string name;
    std::string text; ///< the details, for people; may hold any characters
    Json members;     ///< the details, for programs: an object
};

Event loadedEvent(const std::string& library, const std::string& name, std::uint32_t apiVersion);
Event initialisedEvent(const Json& configuration);
Event startedEvent();
Event epochOffsetEvent(std::int64_t nanoseconds);

/// @param quality ZEKEL_QUALITY_LENGTH doubles
Event qualityEvent(const double* quality, const std::string& reason);

/// Times in nanoseconds modulo 2^64. The offset is local - reference.
/// @param carried the local time in CLOCK_REALTIME, told when it is of another clock
Event pairEvent(std::uint64_t reference, std::uint64_t local, std::int64_t offset,
                PairKind kind = PairKind::measured, const std::optional<Carried>& carried = {});

Event metadataEvent(const Json& metadata);
Event invalidMetadataEvent(const std::string& text);

/// A status of the plug-in that is not clean: the event "error", or "warning" for a code above 0.
/// @param operation what the host had asked for
/// @param json      the status's text
Event statusEvent(const std::string& operation, std::int32_t code, const std::string& json);

/// Something that went wrong in the host, or a call of the plug-in that breaks the rules.
Event failureEvent(const std::string& operation, const std::string& problem);

/// A call of the plug-in that is refused because the host is stopping.
Event refusedEvent(const std::string& function);

/// Whose time the local times of pairs are.
/// @param clock   its name
/// @param problem why it is not the one that it should be; empty when it is.
/// @param refused so many pairs were not of it
Event clockEvent(const std::string& clock, const std::string& problem, std::uint64_t refused);

/// What became of the time pairs that chronyd might get.
struct ChronyCounts {
    std::uint64_t sent = 0;
    std::uint64_t failed = 0;   ///< it did not take them
    std::uint64_t withheld = 0; ///< it was not to get them
};

/// Whether chronyd takes the time pairs.
/// @param problem why it does not; empty when it does.
Event chronyEvent(const ChronyCounts& counts, const std::string& problem);

/// Nobody can ask how the run stands.
Event statusSocketEvent(const std::string& path, const std::string& problem);

/// The record can be written again.
/// @param output  the record
/// @param events  that are not in it
/// @param seconds for how long none could be written
/// @param problem why
Event lostEvent(const std::string& output, std::uint64_t events, double seconds,
                const std::string& problem);

/// Whether metrics are served.
/// @param address where
/// @param problem why they are not; empty when they are.
Event metricsEvent(const std::string& address, const std::string& problem);

/// The host made a folder that was missing.
Event folderEvent(const std::string& path);

/// A quality or metadata event that came after a signal had ended the run: ptp4l, which gets the
/// terminal's signals too, may have ended before it is stopped.
Event expectedEvent(const Event& event);

/// ptp4l has ended unasked.
/// @param words its last lines
Event daemonEndedEvent(const ChildEnd& end, const std::deque<std::string>& words);

/// Why the run failed, and what to do about it.
Event causeEvent(const std::string& cause);
Event mendEvent(const std::string& mend);

/// The health is another one.
/// @param spent how long it was the one before, in seconds
Event healthEvent(const std::string& state, const std::string& reason, const std::string& before,
                  double spent);

/// A session is over, and the next one follows.
/// @param delay    after so many seconds
/// @param restarts how many there have been, with this one
Event restartEvent(const std::string& cause, double delay, std::uint64_t restarts);

/// With which the event "stopping" tells that the run goes on.
constexpr char restartCause[] = "restart";

Event stoppingEvent(const std::string& cause);
Event stoppedEvent();
Event summaryEvent(double seconds, const Tally& tally);

} // namespace vantelhost
