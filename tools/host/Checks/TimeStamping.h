/// @file
#pragma once

#include <cstdint>
#include <string>

namespace vantelhost {

/// What an interface can do: the kernel's ethtool_ts_info.
struct TimeStamping {
    int error = 0;                  ///< errno; the rest holds when it is 0
    std::uint32_t capabilities = 0; ///< SOF_TIMESTAMPING_*
    int clock = -1;                 ///< of the device /dev/ptpN; -1 when there is none
    std::uint32_t sending = 0;      ///< bits by HWTSTAMP_TX_*
    std::uint32_t receiving = 0;    ///< bits by HWTSTAMP_FILTER_*
};

TimeStamping readTimeStamping(const std::string& interface);

/// What ptp4l lacks there for hardware time stamps, in words; empty when nothing is missing.
/// @param transport ptp4l's network_transport, of which the receive filter has to be
std::string missingForHardware(const TimeStamping& timeStamping, const std::string& transport);

/// The same for software time stamps.
std::string missingForSoftware(const TimeStamping& timeStamping);

} // namespace vantelhost
