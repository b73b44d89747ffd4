/// @file
/// Reading the host's protocol configuration, and writing ptp4l's configuration file from it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include <cjson/cJSON.h>

#include "json/CppJson.h"

namespace zekelVantel {

/// What a session keeps of its protocol configuration.
struct tProtocolConfig {
    std::string udsAddress; ///< ptp4l's management socket
    std::int32_t transportSpecific = 0;
    std::vector<std::string> interfaces;
    std::string configFile =
        "/var/run/morwen/ClockHub/ptp4l_bc.conf"; ///< kept if the host says null
};

/// The protocol configuration as text and as parsed document.
struct tConfigText {
    /// @throws zeerr::Exception -52005 "jsonErrorsInvalidJSON".
    explicit tConfigText(const std::string& json) : text(json), document(json) {}

    std::string text;
    CppJson document;
};

/// Reads one key and replaces the first "$key" in the template text. Kind is std::string,
/// std::int32_t, std::uint32_t or bool; JSON null gives the kind's empty value. "udsAddress" and
/// "transportSpecific" (hexadecimal) are stored in the session as well.
/// @throws zeerr::Exception -52005 for a missing key or placeholder, -52004 for another type;
///         boost::numeric's overflow exceptions; std::invalid_argument and std::out_of_range for a
///         transportSpecific that is no hexadecimal int.
template <typename Kind>
void readParameter(tProtocolConfig& session, const tConfigText& config, const std::string& key,
                   std::string& templateText);

/// Reads the whole configuration and writes ptp4l's configuration file. That file is not checked:
/// when it cannot be written, ptp4l will say so.
/// @throws as readParameter; also for a missing "configFile" or "interface" and their wrong types.
void readProtocolConfig(tProtocolConfig& session, const std::string& configText);

} // namespace zekelVantel
