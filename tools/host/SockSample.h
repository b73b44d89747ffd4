/// @file
#pragma once

#include <cstdint>
#include <string>

namespace vantelhost {

/// The datagram with which chronyd's reference clock SOCK takes one time pair.
/// @param reference,local nanoseconds modulo 2^64, local those of this machine's clock since 1970
std::string sockSample(std::uint64_t reference, std::uint64_t local);

} // namespace vantelhost
