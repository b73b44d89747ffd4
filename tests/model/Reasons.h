/// @file
/// What the library says: reasons of a quality, and log lines up to the code at their end.
#pragma once

namespace reason {
inline constexpr char waiting[] = "Waiting for ptp4l status";
inline constexpr char role[] = "PTP role has changed.";
inline constexpr char unreachable[] =
    "Unable to communicate with PTP sub process while attempting to retrieve time data";
inline constexpr char died[] = "PTP sub process has died unexpectedly";
} // namespace reason

namespace line {
inline constexpr char metaData[] = "update Meta Data: ";
inline constexpr char unreachable[] =
    "Unable to communicate with PTP sub process while attempting to retrieve data,got error: ";
inline constexpr char hostStopping[] = "KEL is stopping, ignoring the error: ";
inline constexpr char hostFailed[] = "Unable to call into KEL in vantel, got error: ";
inline constexpr char deathNotTaken[] =
    "PTP4l process has died, watchdog unable to set quality to unusable,got error: ";
inline constexpr char killing[] = "Killing ptp4l subprocess (pid ";
} // namespace line

/// The metadata of a session that knows nothing.
inline constexpr char nothingKnown[] =
    R"({"gmClockId":"00:00:00:00:00:00:00:00","gmMacAddress":"00:00:00:00:00:00",)"
    R"("localClockId":"00:00:00:00:00:00:00:00","clockClass":0,)"
    R"("clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":0,"priority1":0,"priority2":0,)"
    R"("domainNumber":0,"gmClockClass":0,"gmClockAccuracy":"ACCURACY_UNKNOWN",)"
    R"("gmOffsetLogVariance":0,"gmPriority1":0,"gmPriority2":0})";
