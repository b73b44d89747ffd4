/// @file
/// Files that stand for devices of PTP clocks. PtpDevice.cpp stands in a program before ioctl(2)
/// and clock_gettime(2), for the code that is linked and not loaded.
#pragma once

#include <cstdint>
#include <string>

/// What such a file says. The clock is CLOCK_REALTIME and a difference.
struct PtpDevice {
    enum class Best { precise, extended, kernel, none };

    std::int64_t ahead = 0; ///< of CLOCK_REALTIME, nanoseconds
    Best best =
        Best::precise; ///< of the ways to a cross time stamp; the ones behind it are there, too
    int error = 0;     ///< errno with which the best one fails; 0: it does not
};

/// Of the readings for cross time stamps some take long, and during one the system's clock is set
/// back. The clock is read after three tenths of each. The shortest of a way, in nanoseconds:
constexpr std::int64_t shortestExtended = 300;
constexpr std::int64_t shortestOfKernel = 2001;

/// Writes the file anew: opened ones change with it.
void writePtpDevice(const std::string& path, const PtpDevice& device);
