#include "protocolConfig.h"

#include <cerrno>

#include <fcntl.h>
#include <syslog.h>
#include <unistd.h>

#include "errors/ErrorText.h"
#include "errors/Exception.h"
#include "ptp4lConfigTemplate.h"
#include "tFileDescriptor.h"
#include "json/cJSONUtils.h"
#include "json/tClassicLocale.h"

namespace zekelVantel {
namespace {

template <typename Kind>
Kind getValue(const cJSON* item);

template <>
std::string getValue(const cJSON* item) {
    return getString(item);
}

template <>
std::int32_t getValue(const cJSON* item) {
    return getInt32(item);
}

template <>
std::uint32_t getValue(const cJSON* item) {
    return getUInt32(item);
}

template <>
bool getValue(const cJSON* item) {
    return getBool(item);
}

// std::to_string and not a stream: the host's locale must not reach ptp4l's file.
template <typename Number>
std::string format(Number value) {
    return std::to_string(value);
}

std::string format(const std::string& value) {
    return value;
}

[[noreturn]] void throwParameterTypeMismatch(const std::string& configText, const char* key) {
    zeerr::LocalStatus status;
    zeerr::setError(status, zeerr::site::parameterTypeMismatch);
    zeerr::Resizer resizer(status);
    char* position = zeerr::beginMembers(status);
    position = zeerr::addObject(position, "zesync_debug", resizer);
    position = zeerr::addString(
        position, "message", "Error parsing: expected data type does not match the parsed value.",
        resizer);
    position = zeerr::addString(position, "JSON", configText, resizer);
    zeerr::addString(position, "key", key, resizer);
    throw zeerr::Exception(status);
}

/// The value of an item that may be null, which gives the kind's empty value.
// [oddity no-schema-range] Ranges and defaults of the schema are the host's to apply: a host may
// know a newer ptp4l than we do.
template <typename Kind>
Kind getParameter(const tConfigText& config, const char* key, const cJSON* item) {
    if (isNull(item)) {
        return Kind();
    }
    try {
        return getValue<Kind>(item);
    } catch (const zeerr::Exception&) { // GCOVR_EXCL_BR_LINE: others never come here
        throwParameterTypeMismatch(config.text, key);
    }
}

const cJSON* lookUp(const tConfigText& config, const char* key) {
    return cJSON_GetObjectItem(config.document.root(), key);
}

void readConfigFile(tProtocolConfig& session, const tConfigText& config) {
    const cJSON* item = lookUp(config, "configFile");
    if (item == nullptr) {
        syslog(LOG_ERR, "configFile not found in protocol config for vantel");
        zeerr::throwError(zeerr::site::configFileNotFound);
    }
    if (!isNull(item)) {
        session.configFile = getParameter<std::string>(config, "configFile", item);
    }
}

void readInterfaces(tProtocolConfig& session, const tConfigText& config) {
    const cJSON* item = lookUp(config, "interface");
    if (item == nullptr || isNull(item)) {
        syslog(LOG_ERR, "interface not found in protocol config for vantel");
        zeerr::throwError(zeerr::site::interfaceNotFound);
    }
    session.interfaces = toStringList(item);
}

// [oddity unchecked-file] Nothing is reported: ptp4l names its file and the reason better than we
// can. Without O_NONBLOCK, a FIFO that somebody put at this path would hold the host for ever.
void writeFile(const std::string& path, const std::string& text) {
    const tFileDescriptor file(
        open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_NONBLOCK | O_CLOEXEC, 0666));
    std::size_t written = 0;
    while (written < text.size()) {
        const ssize_t count = write(file.get(), text.data() + written, text.size() - written);
        if (count > 0) {
            written += static_cast<std::size_t>(count);
        } else if (count == 0 || errno != EINTR) {
            return;
        }
    }
}

} // namespace

template <typename Kind>
void readParameter(tProtocolConfig& session, const tConfigText& config, const std::string& key,
                   std::string& templateText) {
    const cJSON* item = lookUp(config, key.c_str());
    if (item == nullptr) {
        syslog(LOG_ERR, "Key %s not found in protocol config for vantel", key.c_str());
        zeerr::throwError(zeerr::site::keyNotFound);
    }
    const std::string value = format(getParameter<Kind>(config, key.c_str(), item));
    const std::string placeholder = "$" + key;
    const std::size_t position = templateText.find(placeholder);
    if (position == std::string::npos) {
        // [oddity paramater] Spelt so on purpose: those who watch the log search for this text.
        syslog(LOG_ERR, "Invalid paramater %s in configuration file for vantel", key.c_str());
        zeerr::throwError(zeerr::site::placeholderNotFound);
    }
    // [oddity placeholder-in-value] A value is searched like the template: integrators build one
    // value from another with it.
    templateText.replace(position, placeholder.size(), value);
    if (key == "udsAddress") {
        session.udsAddress = value;
    } else if (key == "transportSpecific") {
        session.transportSpecific = std::stoi(value, nullptr, 16);
    }
}

template void readParameter<std::string>(tProtocolConfig&, const tConfigText&, const std::string&,
                                         std::string&);
template void readParameter<std::int32_t>(tProtocolConfig&, const tConfigText&, const std::string&,
                                          std::string&);
template void readParameter<std::uint32_t>(tProtocolConfig&, const tConfigText&, const std::string&,
                                           std::string&);
template void readParameter<bool>(tProtocolConfig&, const tConfigText&, const std::string&,
                                  std::string&);

void readProtocolConfig(tProtocolConfig& session, const std::string& configText) {
    const tClassicLocale locale;
    const tConfigText config(configText);
    std::string text = ptp4lConfigTemplate;
    readParameter<std::uint32_t>(session, config, "neighborPropDelayThreshold", text);
    readParameter<std::int32_t>(session, config, "logAnnounceInterval", text);
    readParameter<std::int32_t>(session, config, "logSyncInterval", text);
    readParameter<std::int32_t>(session, config, "priority1", text);
    readParameter<std::int32_t>(session, config, "priority2", text);
    readParameter<std::int32_t>(session, config, "offsetScaledLogVariance", text);
    readParameter<std::string>(session, config, "udsAddress", text);
    readParameter<std::string>(session, config, "transportSpecific", text);
    readParameter<std::int32_t>(session, config, "syncReceiptTimeout", text);
    readParameter<bool>(session, config, "assumeTwoStep", text);
    readParameter<bool>(session, config, "pathTraceEnabled", text);
    readParameter<bool>(session, config, "followUpInfo", text);
    readParameter<std::string>(session, config, "networkTransport", text);
    readParameter<std::string>(session, config, "delayMechanism", text);
    readParameter<std::string>(session, config, "ptpDstMac", text);
    readConfigFile(session, config);
    readInterfaces(session, config);
    writeFile(session.configFile, text);
}

} // namespace zekelVantel
