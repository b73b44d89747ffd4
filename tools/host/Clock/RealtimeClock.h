/// @file
#pragma once

#include "Clock/LocalClock.h"

namespace vantelhost {

/// CLOCK_REALTIME, which time stamps in software are of.
class RealtimeClock : public LocalClock {
public:
    const std::string& name() const override { return name_; }
    std::optional<std::uint64_t> now() const override;
    std::optional<CrossTime> cross() override;

private:
    const std::string name_ = "CLOCK_REALTIME";
};

} // namespace vantelhost
