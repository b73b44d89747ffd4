#include "SockSample.h"

#include <cstring>

#include <sys/time.h>

namespace vantelhost {

namespace {

/// As chronyd declares it. The first member is the platform's own struct timeval, as chronyd is
/// built with: this file is compiled without the wide types that the rest of the host has on 32
/// bits.
struct Sample {
    timeval tv;    ///< local time
    double offset; ///< what must be added to it for the true time, in seconds
    int pulse;
    int leap;
    int padding;
    int magic;
};

} // namespace

std::string sockSample(std::uint64_t reference, std::uint64_t local) {
    constexpr std::uint64_t second = 1000000000;
    Sample sample{};
    sample.tv.tv_sec = static_cast<decltype(sample.tv.tv_sec)>(local / second);
    sample.tv.tv_usec = static_cast<decltype(sample.tv.tv_usec)>(local % second / 1000);
    // The microseconds leave some nanoseconds out of the time, but not out of the offset.
    sample.offset = static_cast<double>(static_cast<std::int64_t>(reference - local)) / 1e9;
    sample.magic = 0x534F434B;
    std::string datagram(sizeof(sample), '\0');
    std::memcpy(datagram.data(), &sample, sizeof(sample));
    return datagram;
}

} // namespace vantelhost
