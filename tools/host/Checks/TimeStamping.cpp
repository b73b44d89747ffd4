#include "Checks/TimeStamping.h"

#include <cerrno>
#include <vector>

#include <net/if.h>
#include <strings.h>

#include <linux/ethtool.h>
#include <linux/net_tstamp.h>
#include <linux/sockios.h>

#include "Checks/InterfaceRequest.h"

namespace vantelhost {

namespace {

constexpr std::uint32_t bit(unsigned number) {
    return 1U << number;
}

/// Those that let ptp4l have event messages of version 2.
std::uint32_t eventFilters(const std::string& transport) {
    constexpr auto both = bit(HWTSTAMP_FILTER_ALL) | bit(HWTSTAMP_FILTER_PTP_V2_EVENT);
    constexpr auto udp = bit(HWTSTAMP_FILTER_PTP_V2_L4_EVENT);
    constexpr auto ethernet = bit(HWTSTAMP_FILTER_PTP_V2_L2_EVENT);
    const auto is = [&](const char* name) { return ::strcasecmp(transport.c_str(), name) == 0; };
    if (is("UDPv4") || is("UDPv6")) {
        return both | udp;
    }
    return is("L2") ? both | ethernet : both | udp | ethernet;
}

struct Part {
    bool isThere;
    std::string name;
};

std::string missingOf(const std::vector<Part>& parts) {
    std::string missing;
    for (const auto& part : parts) {
        if (!part.isThere) {
            missing += (missing.empty() ? "" : ", ") + part.name;
        }
    }
    return missing;
}

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

std::string missingForHardware(const TimeStamping& timeStamping, const std::string& transport) {
    const auto can = [&](std::uint32_t flag) { return (timeStamping.capabilities & flag) != 0; };
    return missingOf({
        {can(SOF_TIMESTAMPING_TX_HARDWARE), "hardware-transmit"},
        {can(SOF_TIMESTAMPING_RX_HARDWARE), "hardware-receive"},
        {can(SOF_TIMESTAMPING_RAW_HARDWARE), "hardware-raw-clock"},
        {(timeStamping.sending & bit(HWTSTAMP_TX_ON)) != 0, "transmit mode on"},
        {(timeStamping.receiving & eventFilters(transport)) != 0,
         "receive filter for PTPv2 events" + (transport.empty() ? "" : " over " + transport)},
        {timeStamping.clock >= 0, "PTP hardware clock"},
    });
}

std::string missingForSoftware(const TimeStamping& timeStamping) {
    const auto can = [&](std::uint32_t flag) { return (timeStamping.capabilities & flag) != 0; };
    return missingOf({
        {can(SOF_TIMESTAMPING_TX_SOFTWARE), "software-transmit"},
        {can(SOF_TIMESTAMPING_RX_SOFTWARE), "software-receive"},
        {can(SOF_TIMESTAMPING_SOFTWARE), "software-system-clock"},
    });
}

} // namespace vantelhost
