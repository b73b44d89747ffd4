/// @file
/// Which answers a request gets, and what the faults make of them before they are encoded.
#pragma once

#include "Request.h"
#include "Script.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace simptp4l {

/// One datagram to come.
struct Answer {
    unsigned port = 0;                  ///< who answers; 0: the clock
    std::optional<std::uint16_t> error; ///< MANAGEMENT_ERROR_STATUS with this code
    bool otherPort = false;             ///< carry another port number
    std::optional<std::int64_t> exactLength;
    std::int64_t lengthChange = 0;
    std::optional<std::int64_t> garbage; ///< that many pseudo-random octets instead
};

struct Plan {
    std::vector<Answer> answers;
    std::int64_t delay = 0;
    bool late = false; ///< keep until the next request
};

/// What ptp4l would do, with ports 1 to numberPorts.
Plan planFor(const Request& request, unsigned numberPorts);

/// Applies an action that changes answers. Actions that change the simulator leave the plan alone.
void apply(const Action& action, Plan& plan);

} // namespace simptp4l
