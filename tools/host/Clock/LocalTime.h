/// @file
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "Checks/TimeStamping.h"
#include "Clock/LocalClock.h"
#include "Clock/PairCarrier.h"
#include "Events.h"
#include "Json.h"

namespace vantelhost {

/// Where a machine's PTP clocks show themselves.
struct PtpClocks {
    std::string dev = "/dev";
    TimeStamping (*timeStamping)(const std::string& interface) = readTimeStamping;
};

/// Whose time the local times of pairs are, as --clock says: answers in that time, and carries
/// pairs over from it.
class LocalTime {
public:
    /// @param option  "realtime", the path of a PTP clock's device, or "auto": the PTP clock of the
    ///                first interface, CLOCK_REALTIME where that has none
    /// @param always  judge and carry pairs over also where "auto" is CLOCK_REALTIME: somebody
    ///                takes them
    /// @param onError told once, by any thread, when the clock cannot be read
    /// Throws UsageError when the device is no clock that can be read.
    LocalTime(std::string option, bool always, std::function<void(const Event&)> onError,
              PtpClocks clocks = {});

    /// Takes the clock for a session to come, while there is none. A device that cannot be opened
    /// is not used: CLOCK_REALTIME is.
    /// @param settings of the plug-in, with its interfaces
    /// @return an event when that is another clock than before, which is CLOCK_REALTIME with
    /// "auto".
    std::optional<Event> choose(const Json& settings);

    /// Whether it is CLOCK_REALTIME.
    bool isRealtime() const { return isRealtime_; }

    /// The clock's nanoseconds; those of CLOCK_REALTIME when it cannot be read. From any thread.
    std::uint64_t now();

    /// See PairCarrier. One thread at a time, as the next two.
    PairCarrier::Result carry(std::uint64_t local);

    /// Hears of sessions and epoch offsets.
    void take(const Event& event);

    /// An event, if pairs are refused.
    std::optional<Event> state() const;

private:
    std::string deviceFor(const Json& settings) const;

    const std::string option_;
    const bool always_;
    const std::function<void(const Event&)> onError_;
    const PtpClocks clocks_;
    std::unique_ptr<LocalClock> clock_;
    bool isRealtime_ = true;
    std::string told_; ///< the text of the last event of choose(), or what goes without saying
    std::atomic<bool> failureIsTold_{false};
    PairCarrier carrier_;
};

} // namespace vantelhost
