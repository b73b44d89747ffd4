#include "Clock/LocalTime.h"

#include <cerrno>
#include <system_error>
#include <utility>

#include <fmt/format.h>

#include "Clock/LikelyClock.h"
#include "Clock/PtpClock.h"
#include "Clock/RealtimeClock.h"
#include "Moment.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

constexpr char automatic[] = "auto";
constexpr char realtime[] = "realtime";

void refuseUnreadable(const std::string& path) {
    try {
        const PtpClock clock(path);
    } catch (const std::system_error& error) {
        throw UsageError(fmt::format("the clock {}", error.what()));
    }
}

} // namespace

LocalTime::LocalTime(std::string option, bool always, std::function<void(const Event&)> onError,
                     PtpClocks clocks)
    : option_(std::move(option)),
      always_(always || option_ != automatic),
      onError_(std::move(onError)),
      clocks_(std::move(clocks)),
      clock_(std::make_unique<RealtimeClock>()),
      carrier_([this](std::uint64_t local, const std::string& clock) {
          return otherClockText(local, clock, knownClocks(clocks_.dev));
      }) {
    if (option_ == automatic) {
        told_ = clockEvent(clock_->name(), "", 0).text;
    } else if (option_ != realtime) {
        refuseUnreadable(option_);
    }
}

std::optional<Event> LocalTime::choose(const Json& settings) {
    const std::string device = deviceFor(settings);
    std::string problem;
    clock_ = std::make_unique<RealtimeClock>();
    isRealtime_ = true;
    failureIsTold_ = false;
    try {
        if (!device.empty()) {
            clock_ = std::make_unique<PtpClock>(device);
            isRealtime_ = false;
        }
    } catch (const std::system_error& error) {
        problem = error.what();
    }
    Event event = clockEvent(clock_->name(), problem, 0);
    const bool isNews = std::exchange(told_, event.text) != event.text;
    return isNews ? std::optional(std::move(event)) : std::nullopt;
}

std::string LocalTime::deviceFor(const Json& settings) const {
    if (option_ != automatic) {
        return option_ == realtime ? "" : option_;
    }
    const auto interfaces = settings.find("interface");
    if (interfaces == settings.end() || !interfaces->is_array() || interfaces->empty() ||
        !interfaces->front().is_string()) {
        return "";
    }
    const auto timeStamping = clocks_.timeStamping(interfaces->front().get<std::string>());
    const bool has = timeStamping.error == 0 && timeStamping.clock >= 0;
    return has ? fmt::format("{}/ptp{}", clocks_.dev, timeStamping.clock) : "";
}

std::uint64_t LocalTime::now() {
    if (const auto time = clock_->now()) {
        return *time;
    }
    const int error = errno;
    if (!failureIsTold_.exchange(true)) {
        onError_(failureEvent("clock", fmt::format("{} cannot be read: {}; the plug-in is told "
                                                   "CLOCK_REALTIME",
                                                   clock_->name(), errorText(error))));
    }
    return realtimeNanoseconds();
}

PairCarrier::Result LocalTime::carry(std::uint64_t local) {
    if (isRealtime_ && !always_) {
        return {};
    }
    auto result = carrier_.carry(*clock_, local);
    if (result.time) {
        result.time->isOfOtherClock = !isRealtime_;
    }
    return result;
}

void LocalTime::take(const Event& event) {
    if (event.name == "initialised") {
        carrier_.begin();
    } else if (event.name == "epoch-offset") {
        carrier_.epochOffset(event.members["offset"].get<std::int64_t>());
    }
}

std::optional<Event> LocalTime::state() const {
    const auto refused = carrier_.refused();
    return refused > 0 ? std::optional(clockEvent(clock_->name(), "", refused)) : std::nullopt;
}

} // namespace vantelhost
