#include "Config.h"

#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <system_error>

namespace simptp4l {
namespace {

std::string located(const std::string& path, unsigned line, const std::string& text) {
    std::string located = path;
    return located.append(":").append(std::to_string(line)).append(": ").append(text);
}

struct IntegerKey {
    const char* key;
    int Config::*member;
    int min;
    int max;
};

constexpr IntegerKey integerKeys[] = {
    {"priority1", &Config::priority1, 0, 255},
    {"priority2", &Config::priority2, 0, 255},
    {"domainNumber", &Config::domainNumber, 0, 127},
    {"transportSpecific", &Config::transportSpecific, 0, 15},
    {"twoStepFlag", &Config::twoStepFlag, 0, 1},
    {"slaveOnly", &Config::slaveOnly, 0, 1},
    {"clientOnly", &Config::slaveOnly, 0, 1},
    {"clockClass", &Config::clockClass, 0, 255},
    {"clockAccuracy", &Config::clockAccuracy, 0, 255},
    {"offsetScaledLogVariance", &Config::offsetScaledLogVariance, 0, 65535},
    {"logAnnounceInterval", &Config::logAnnounceInterval, -128, 127},
    {"logSyncInterval", &Config::logSyncInterval, -128, 127},
    {"logMinDelayReqInterval", &Config::logMinDelayReqInterval, -128, 127},
    {"logMinPdelayReqInterval", &Config::logMinPdelayReqInterval, -128, 127},
    {"announceReceiptTimeout", &Config::announceReceiptTimeout, 2, 255},
    {"neighborPropDelayThresh", &Config::neighborPropDelayThresh, 0, 2147483647},
    {"follow_up_info", &Config::followUpInfo, 0, 1},
};

struct WordKey {
    const char* key;
    const char* word;
    int Config::*member;
    int value;
};

constexpr WordKey wordKeys[] = {
    {"delay_mechanism", "E2E", &Config::delayMechanism, 1},
    {"delay_mechanism", "P2P", &Config::delayMechanism, 2},
    {"time_stamping", "software", &Config::timestamping, 0},
    {"time_stamping", "hardware", &Config::timestamping, 1},
    {"time_stamping", "legacy", &Config::timestamping, 2},
};

bool readInteger(const std::string& text, const IntegerKey& key, Config& config) {
    char* end = nullptr;
    errno = 0;
    const long long value = std::strtoll(text.c_str(), &end, 0);
    if (text.empty() || *end != '\0' || errno != 0 || value < key.min || value > key.max) {
        return false;
    }
    config.*key.member = static_cast<int>(value);
    return true;
}

/// @return false when the value of a key that matters cannot be read.
bool readSetting(const std::string& key, const std::string& value, Config& config) {
    if (key == "uds_address") {
        config.udsAddress = value;
        return !value.empty();
    }
    for (const WordKey& entry : wordKeys) {
        if (key == entry.key && value == entry.word) {
            config.*entry.member = entry.value;
        }
    }
    for (const IntegerKey& entry : integerKeys) {
        if (key == entry.key) {
            return readInteger(value, entry, config);
        }
    }
    return true;
}

} // namespace

Config readConfig(const std::string& path, std::vector<std::string>& errors) {
    Config config;
    std::ifstream file(path);
    if (!file) {
        errors.push_back(path + ": " + std::generic_category().message(errno));
        return config;
    }
    bool global = true;
    std::string line;
    for (unsigned number = 1; std::getline(file, line); ++number) {
        std::istringstream words(line);
        std::string key;
        std::string value;
        words >> key >> value;
        if (key.empty() || key[0] == '#') {
            continue;
        }
        if (key[0] == '[') {
            global = key == "[global]";
        } else if (global && !readSetting(key, value, config)) {
            errors.push_back(located(path, number, "bad value for " + key));
        }
    }
    return config;
}

} // namespace simptp4l
