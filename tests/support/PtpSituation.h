/// @file
#pragma once

#include <string>
#include <vector>

#include "support/Octets.h"
#include "tPtp4lMetaData.h"

/// Everything that metadata is made from.
struct PtpSituation {
    zekelVantel::tParentDataSet parent;
    zekelVantel::tDefaultDataSet local;
    std::vector<zekelVantel::tPortDataSet> portDataSets;
    std::vector<zekelVantel::tPortDataSetNp> portDataSetsNp;
    std::vector<zekelVantel::tPortProperties> portProperties;
};

/// From the 32 octets of the data field, in hexadecimal.
inline zekelVantel::tParentDataSet parentDataSet(const std::string& data) {
    return readFrom<zekelVantel::tPtp4lParentDataSetMgmtTlv>(octets("0001 0022 2002" + data))
        .data();
}

/// From the 20 octets of the data field, in hexadecimal.
inline zekelVantel::tDefaultDataSet defaultDataSet(const std::string& data) {
    return readFrom<zekelVantel::tPtp4lDefaultDataSetMgmtTlv>(octets("0001 0016 2000" + data))
        .data();
}

/// From the 26 octets of the data field, in hexadecimal.
inline zekelVantel::tPortDataSet portDataSet(const std::string& data) {
    return readFrom<zekelVantel::tPtp4lPortDataSetMgmtTlv>(octets("0001 001C 2004" + data)).data();
}

/// From the 8 octets of the data field, in hexadecimal.
inline zekelVantel::tPortDataSetNp portDataSetNp(const std::string& data) {
    return readFrom<zekelVantel::tPtp4lPortDataSetNpMgmtTlv>(octets("0001 000A C002" + data))
        .data();
}

/// Of a port that has this interface; the rest does not reach the metadata.
inline zekelVantel::tPortProperties portProperties(const std::string& interface) {
    Octets datagram = octets("0001 0012 C004 001B21FFFE0A0B0C 0001 05 01");
    datagram.push_back(static_cast<std::uint8_t>(interface.size()));
    datagram.insert(datagram.end(), interface.begin(), interface.end());
    return readFrom<zekelVantel::tPtp4lPortPropertiesMgmtTlv>(datagram).data();
}

/// From the 4 octets of a ClockQuality, in hexadecimal.
inline zekelVantel::tPtpClockQuality clockQuality(const std::string& data) {
    return readFrom<zekelVantel::tPtpClockQuality>(octets(data));
}

/// The identity of a port of some clock.
inline zekelVantel::tPtpPortIdentity portIdentity(std::uint16_t portNumber) {
    return {zekelVantel::tPtpClockIdentity(0x001B21FFFE0A0B0C), portNumber};
}

/// Adds a port that is in no way special.
inline void addPort(PtpSituation& situation, std::uint16_t portNumber,
                    const std::string& interface = "eth0") {
    zekelVantel::tPortDataSet dataSet;
    dataSet.portIdentity = portIdentity(portNumber);
    situation.portDataSets.push_back(dataSet);
    situation.portDataSetsNp.emplace_back();
    situation.portProperties.push_back(portProperties(interface));
}

inline zekelVantel::tPtp4lMetaData metaDataOf(const PtpSituation& situation) {
    zekelVantel::tPtp4lMetaData metaData;
    zeerr::LocalStatus status;
    metaData.takeGrandmaster(situation.parent);
    metaData.takeLocalClock(situation.local);
    metaData.takePorts(situation.portDataSets, situation.portDataSetsNp, situation.portProperties,
                       status);
    EXPECT_EQ(status.code, 0);
    return metaData;
}
