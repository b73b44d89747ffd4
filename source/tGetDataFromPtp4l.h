/// @file
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tPtp4lMetaData.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgInterface.h"

namespace zekelVantel {

/// Asks a running ptp4l for all that the host is told. Used by one thread.
class tGetDataFromPtp4l {
public:
    /// @param remoteAddress     path of ptp4l's management socket.
    /// @param transportSpecific stands in every request; the low 4 bits count.
    tGetDataFromPtp4l(const std::string& remoteAddress, std::uint8_t transportSpecific);
    virtual ~tGetDataFromPtp4l();

    /// Asks everything afresh: six requests, 3 answers and 3 for each port, each awaited at most 2
    /// s. After a failure the socket is closed, and the next call binds it anew; what was filled so
    /// far stays filled.
    /// @param metaData a fresh object to fill.
    /// @return 0, or the negative code of the failure. Throws nothing.
    virtual std::int32_t fetch(tTimeStatus& timeStatus, tPtp4lMetaData& metaData);

private:
    void openOnDemand();
    void fetchMetaData(tPtp4lMetaData& metaData);

    void getSingle(tPtpMgmtTlv& answer);

    template <typename Tlv>
    std::vector<typename Tlv::Data> getFromPorts(std::uint16_t numberPorts);

    std::vector<tPortProperties> getPortProperties(std::uint16_t numberPorts);

    tUdsMsgInterface interface_;
    tPtpMgmtNode node_;
    tUdsMsgAddress remoteAddress_;
    tPadOctet padOctet_ = tPadOctet::uncounted; ///< of PORT_PROPERTIES_NP requests
};

} // namespace zekelVantel
