/// @file
#pragma once

#include <cstdint>

namespace vantelhost {

/// What a measure of stability is for one time.
struct TauValue {
    double tau;          ///< seconds
    double value;        ///< in the measure's unit
    std::uint64_t terms; ///< how many sums or windows it is made of; at least 1
};

} // namespace vantelhost
