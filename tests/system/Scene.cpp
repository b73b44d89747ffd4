#include "system/Scene.h"

#include <cstdlib>
#include <sstream>

#include <nlohmann/json.hpp>

std::string sceneVariable(const char* name) {
    const char* const value = std::getenv(name);
    return value == nullptr ? "" : value;
}

std::vector<std::string> sceneInterfaces() {
    std::istringstream words(sceneVariable("TESTBED_INTERFACES"));
    std::vector<std::string> interfaces;
    for (std::string interface; words >> interface;) {
        interfaces.push_back(interface);
    }
    return interfaces;
}

std::string sceneSocket() {
    return sceneVariable("TESTBED_FOLDER") + "/boundary.uds";
}

std::string sceneConfiguration() {
    return nlohmann::json{
        {"neighborPropDelayThreshold", 20000000},
        {"logAnnounceInterval", 0},
        {"logSyncInterval", -3},
        {"priority1", 128},
        {"priority2", 128},
        {"offsetScaledLogVariance", 65535},
        {"udsAddress", sceneSocket()},
        {"transportSpecific", "0x0"},
        {"syncReceiptTimeout", 0},
        {"assumeTwoStep", false},
        {"pathTraceEnabled", false},
        {"followUpInfo", false},
        {"networkTransport", "UDPv4"},
        {"delayMechanism", "E2E"},
        {"configFile", sceneVariable("TESTBED_FOLDER") + "/boundary.conf"},
        {"ptpDstMac", "01:1B:19:00:00:00"},
        {"interface", sceneInterfaces()},
    }
        .dump();
}
