/// @file
/// What the simulated daemon takes from a ptp4l configuration file.
#pragma once

#include <string>
#include <vector>

namespace simptp4l {

/// The values of the [global] section, with ptp4l's defaults.
struct Config {
    std::string udsAddress = "/var/run/ptp4l";
    int priority1 = 128;
    int priority2 = 128;
    int domainNumber = 0;
    int transportSpecific = 0;
    int twoStepFlag = 1;
    int slaveOnly = 0;
    int clockClass = 248;
    int clockAccuracy = 0xFE;
    int offsetScaledLogVariance = 0xFFFF;
    int logAnnounceInterval = 1;
    int logSyncInterval = 0;
    int logMinDelayReqInterval = 0;
    int logMinPdelayReqInterval = 0;
    int announceReceiptTimeout = 3;
    int neighborPropDelayThresh = 20000000;
    int followUpInfo = 0;
    int delayMechanism = 1; ///< as on the wire: 1 end to end, 2 peer to peer
    int timestamping = 1;   ///< as on the wire: 0 software, 1 hardware, 2 legacy
};

/// Reads a configuration file. Keys that the simulator has no use for, and sections other than
/// [global], are skipped.
/// @param errors receives one "FILE:LINE: text" for each value that cannot be read, or one text
///               when the file cannot be opened.
Config readConfig(const std::string& path, std::vector<std::string>& errors);

} // namespace simptp4l
