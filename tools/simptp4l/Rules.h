/// @file
/// Which of the script's fault rules a request meets.
#pragma once

#include "Script.h"

#include <cstdint>
#include <vector>

namespace simptp4l {

/// Counts the requests that each rule has matched.
class Rules {
public:
    explicit Rules(const std::vector<Rule>& rules);

    /// The actions for one request, in the script's order. Each call counts as a request.
    std::vector<Action> match(std::uint16_t managementId, std::int64_t now);

private:
    struct Counted {
        Rule rule;
        std::uint64_t matched = 0;
    };
    std::vector<Counted> rules_;
};

} // namespace simptp4l
