/// @file
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "errors/Status.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"

namespace zekelVantel {

/// What the host is told about one port. The views are of string literals.
struct tPortMetaData {
    std::string_view portState = "PTP_DISABLED"; ///< linuxptp's name of IEEE 1588-2008 table 8
    std::string_view asCapable = "false";        ///< "true" or "false"
    std::int8_t logAnnounceInterval = 0;
    std::int8_t logSyncInterval = 0;
    std::int8_t logPdelayInterval = 0;
    std::uint32_t neighborPropDelayThreshold = 0; ///< ns
    std::string interface;

    bool operator==(const tPortMetaData& other) const;
};

/// What the host is told about the grandmaster, the local clock and the ports. A fresh object is
/// what it is told while ptp4l does not answer.
class tPtp4lMetaData {
public:
    tPtp4lMetaData() = default;
    tPtp4lMetaData(const tPtp4lMetaData&) = default;
    tPtp4lMetaData(tPtp4lMetaData&&) = default;
    tPtp4lMetaData& operator=(const tPtp4lMetaData&) = default;
    tPtp4lMetaData& operator=(tPtp4lMetaData&&) = default;
    virtual ~tPtp4lMetaData();

    void takeGrandmaster(const tParentDataSet& parent);
    void takeLocalClock(const tDefaultDataSet& local);

    /// Takes the ports from three lists that belong together element by element. The last of
    /// several elements with the same portNumber stays. Error: -52024 when the lengths differ;
    /// there are then no ports.
    void takePorts(const std::vector<tPortDataSet>& portDataSets,
                   const std::vector<tPortDataSetNp>& portDataSetsNp,
                   const std::vector<tPortProperties>& portProperties, zeerr::Status& status);

    bool operator==(const tPtp4lMetaData& other) const;
    bool operator!=(const tPtp4lMetaData& other) const { return !(*this == other); }

    /// One JSON object without white space.
    std::string toJson() const;

private:
    using NumberedPort = std::pair<std::uint16_t, tPortMetaData>;

    void sortPorts();

    tPtpClockIdentity gmClockId_;
    std::uint8_t gmClockClass_ = 0;
    std::string_view gmClockAccuracy_ = "ACCURACY_UNKNOWN";
    std::uint16_t gmOffsetLogVariance_ = 0;
    std::uint8_t gmPriority1_ = 0;
    std::uint8_t gmPriority2_ = 0;
    tPtpClockIdentity localClockId_;
    std::uint8_t clockClass_ = 0;
    std::string_view clockAccuracy_ = "ACCURACY_UNKNOWN";
    std::uint16_t offsetLogVariance_ = 0;
    std::uint8_t priority1_ = 0;
    std::uint8_t priority2_ = 0;
    std::uint8_t domainNumber_ = 0;
    std::vector<NumberedPort> ports_; ///< by portNumber, each once
};

} // namespace zekelVantel
