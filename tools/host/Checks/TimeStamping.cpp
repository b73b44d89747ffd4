#include "Checks/TimeStamping.h"

#include <cerrno>

#include <net/if.h>

#include <linux/ethtool.h>
#include <linux/net_tstamp.h>
#include <linux/sockios.h>

#include "Checks/InterfaceRequest.h"

namespace vantelhost {

namespace {

constexpr std::uint32_t bit(unsigned number) {
    return 1U << number;
}

/// Each of them lets ptp4l have event messages of version 2.
constexpr std::uint32_t eventFilters =
    bit(HWTSTAMP_FILTER_ALL) | bit(HWTSTAMP_FILTER_PTP_V2_EVENT) |
    bit(HWTSTAMP_FILTER_PTP_V2_L4_EVENT) | bit(HWTSTAMP_FILTER_PTP_V2_L2_EVENT);

} // namespace

TimeStamping readTimeStamping(const std::string& interface) {
    TimeStamping result;
    if (::if_nametoindex(interface.c_str()) == 0) {
        result.error = errno;
        return result;
    }
    ethtool_ts_info info{};
    info.cmd = ETHTOOL_GET_TS_INFO;
    InterfaceRequest request(interface);
    request.get().ifr_data = reinterpret_cast<char*>(&info);
    result.error = request.ask(SIOCETHTOOL);
    result.capabilities = info.so_timestamping;
    result.clock = info.phc_index;
    result.sending = info.tx_types;
    result.receiving = info.rx_filters;
    return result;
}

std::string missingForHardware(const TimeStamping& timeStamping) {
    const auto can = [&](std::uint32_t flag) { return (timeStamping.capabilities & flag) != 0; };
    const struct {
        bool isThere;
        const char* name;
    } parts[] = {
        {can(SOF_TIMESTAMPING_TX_HARDWARE), "hardware-transmit"},
        {can(SOF_TIMESTAMPING_RX_HARDWARE), "hardware-receive"},
        {can(SOF_TIMESTAMPING_RAW_HARDWARE), "hardware-raw-clock"},
        {(timeStamping.sending & bit(HWTSTAMP_TX_ON)) != 0, "transmit mode on"},
        {(timeStamping.receiving & eventFilters) != 0, "receive filter for PTPv2 events"},
        {timeStamping.clock >= 0, "PTP hardware clock"},
    };
    std::string missing;
    for (const auto& part : parts) {
        if (!part.isThere) {
            missing += (missing.empty() ? "" : ", ") + std::string(part.name);
        }
    }
    return missing;
}

} // namespace vantelhost
