#include "tPtp4lMetaData.h"

#include <algorithm>
#include <array>
#include <initializer_list>
#include <map>
#include <tuple>
#include <utility>

#include "errors/ErrorText.h"
#include "errors/Exception.h"

namespace zekelVantel {
namespace {

/// clockAccuracy from 0x20 on, IEEE 1588-2008 table 6.
constexpr std::uint8_t firstAccuracy = 0x20;
constexpr std::array<std::string_view, 18> accuracyNames = {
    "WITHIN_25NS", "WITHIN_100NS", "WITHIN_250NS", "WITHIN_1US", "WITHIN_2.5US", "WITHIN_10US",
    "WITHIN_25US", "WITHIN_100US", "WITHIN_250US", "WITHIN_1MS", "WITHIN_2.5MS", "WITHIN_10MS",
    "WITHIN_25MS", "WITHIN_100MS", "WITHIN_250MS", "WITHIN_1S",  "WITHIN_10S",   "GREATER_THAN_10S",
};

/// portState, linuxptp `enum port_state`.
constexpr std::array<std::string_view, 11> portStateNames = {
    "",
    "PTP_INITIALIZING",
    "PTP_FAULTY",
    "PTP_DISABLED",
    "PTP_LISTENING",
    "PTP_PRE_MASTER",
    "PTP_MASTER",
    "PTP_PASSIVE",
    "PTP_UNCALIBRATED",
    "PTP_SLAVE",
    "PTP_GRAND_MASTER",
};

std::string_view accuracyName(std::uint8_t clockAccuracy) {
    const unsigned index = unsigned{clockAccuracy} - firstAccuracy;
    return index < accuracyNames.size() ? accuracyNames[index] : "ACCURACY_UNKNOWN";
}

std::string_view portStateName(std::uint8_t portState) {
    return portState < portStateNames.size() ? portStateNames[portState] : "";
}

std::string octetText(const tPtpClockIdentity& identity,
                      std::initializer_list<std::size_t> chosen) {
    constexpr char digits[] = "0123456789ABCDEF";
    std::string text(chosen.size() * 3 - 1, ':');
    std::size_t place = 0;
    for (const std::size_t index : chosen) {
        const std::uint8_t octet = identity.octets()[index];
        text[place] = digits[octet >> 4];
        text[place + 1] = digits[octet & 0x0f];
        place += 3;
    }
    return text;
}

std::string clockIdText(const tPtpClockIdentity& identity) {
    return octetText(identity, {0, 1, 2, 3, 4, 5, 6, 7});
}

// [oddity mac-of-clock-id] The middle octets are dropped whatever they are: hosts expect six, also
// from an identity that was not made from a MAC address.
std::string macText(const tPtpClockIdentity& identity) {
    return octetText(identity, {0, 1, 2, 5, 6, 7});
}

/// A JSON object under construction.
class tJsonObject {
public:
    void add(std::string_view key, std::string_view value) {
        addRaw(key, '"' + zeerr::escaped(value) + '"');
    }

    void add(std::string_view key, std::int64_t value) { addRaw(key, std::to_string(value)); }

    void addRaw(std::string_view key, std::string_view value) {
        text_ += text_.empty() ? "{\"" : ",\"";
        text_ += key;
        text_ += "\":";
        text_ += value;
    }

    std::string finish() && {
        text_ += '}';
        return std::move(text_);
    }

private:
    std::string text_;
};

std::string portJson(const tPortMetaData& port) {
    tJsonObject json;
    json.add("portState", port.portState);
    json.addRaw("asCapable", port.asCapable);
    // [oddity port-member-order] The sync interval stands before the announce interval: the order
    // that hosts know.
    json.add("logSyncInterval", port.logSyncInterval);
    json.add("logAnnounceInterval", port.logAnnounceInterval);
    json.add("logPdelayInterval", port.logPdelayInterval);
    json.add("interface", port.interface);
    json.add("neighborPropDelayThreshold", port.neighborPropDelayThreshold);
    return std::move(json).finish();
}

} // namespace

bool tPortMetaData::operator==(const tPortMetaData& other) const {
    const auto fields = [](const tPortMetaData& port) {
        return std::tie(port.portState, port.asCapable, port.logAnnounceInterval,
                        port.logSyncInterval, port.logPdelayInterval,
                        port.neighborPropDelayThreshold, port.interface);
    };
    return fields(*this) == fields(other);
}

tPtp4lMetaData::~tPtp4lMetaData() = default;

void tPtp4lMetaData::takeGrandmaster(const tParentDataSet& parent) {
    gmClockId_ = parent.grandmasterIdentity;
    gmClockClass_ = parent.grandmasterClockQuality.clockClass();
    gmClockAccuracy_ = accuracyName(parent.grandmasterClockQuality.clockAccuracy());
    gmOffsetLogVariance_ = parent.grandmasterClockQuality.offsetScaledLogVariance();
    gmPriority1_ = parent.grandmasterPriority1;
    gmPriority2_ = parent.grandmasterPriority2;
}

void tPtp4lMetaData::takeLocalClock(const tDefaultDataSet& local) {
    localClockId_ = local.clockIdentity;
    clockClass_ = local.clockQuality.clockClass();
    clockAccuracy_ = accuracyName(local.clockQuality.clockAccuracy());
    offsetLogVariance_ = local.clockQuality.offsetScaledLogVariance();
    priority1_ = local.priority1;
    priority2_ = local.priority2;
    domainNumber_ = local.domainNumber;
}

void tPtp4lMetaData::takePorts(const std::vector<tPortDataSet>& portDataSets,
                               const std::vector<tPortDataSetNp>& portDataSetsNp,
                               const std::vector<tPortProperties>& portProperties,
                               zeerr::Status& status) {
    if (zeerr::isError(status)) {
        return;
    }
    ports_.clear();
    if (portDataSets.size() != portDataSetsNp.size() ||
        portDataSets.size() != portProperties.size()) {
        zeerr::setError(status, zeerr::site::portListsDiffer);
        return;
    }
    ports_.reserve(portDataSets.size());
    for (std::size_t i = 0; i < portDataSets.size(); ++i) {
        const tPortDataSet& dataSet = portDataSets[i];
        const tPortDataSetNp& dataSetNp = portDataSetsNp[i];
        tPortMetaData& port =
            ports_.emplace_back(dataSet.portIdentity.portNumber(), tPortMetaData()).second;
        port.portState = portStateName(dataSet.portState);
        port.asCapable = dataSetNp.asCapable != 0 ? std::string_view("true") : "false";
        port.logAnnounceInterval = dataSet.logAnnounceInterval;
        port.logSyncInterval = dataSet.logSyncInterval;
        port.logPdelayInterval = dataSet.logMinPdelayReqInterval;
        port.neighborPropDelayThreshold = dataSetNp.neighborPropDelayThresh;
        port.interface = portProperties[i].interface.text();
    }
    sortPorts();
}

void tPtp4lMetaData::sortPorts() {
    const auto areOutOfOrder = [](const NumberedPort& left, const NumberedPort& right) {
        return left.first >= right.first;
    };
    // ptp4l answers in this order: mostly there is nothing to do.
    if (std::adjacent_find(ports_.begin(), ports_.end(), areOutOfOrder) == ports_.end()) {
        return;
    }
    std::map<std::uint16_t, tPortMetaData> sorted;
    for (auto& [number, port] : ports_) {
        sorted.insert_or_assign(number, std::move(port));
    }
    ports_.assign(sorted.begin(), sorted.end());
}

bool tPtp4lMetaData::operator==(const tPtp4lMetaData& other) const {
    const auto fields = [](const tPtp4lMetaData& data) {
        return std::tie(data.gmClockId_.octets(), data.gmClockClass_, data.gmClockAccuracy_,
                        data.gmOffsetLogVariance_, data.gmPriority1_, data.gmPriority2_,
                        data.localClockId_.octets(), data.clockClass_, data.clockAccuracy_,
                        data.offsetLogVariance_, data.priority1_, data.priority2_,
                        data.domainNumber_, data.ports_);
    };
    return fields(*this) == fields(other);
}

std::string tPtp4lMetaData::toJson() const {
    tJsonObject json;
    json.add("gmClockId", clockIdText(gmClockId_));
    json.add("gmMacAddress", macText(gmClockId_));
    json.add("localClockId", clockIdText(localClockId_));
    json.add("clockClass", clockClass_);
    json.add("clockAccuracy", clockAccuracy_);
    json.add("offsetLogVariance", offsetLogVariance_);
    json.add("priority1", priority1_);
    json.add("priority2", priority2_);
    json.add("domainNumber", domainNumber_);
    json.add("gmClockClass", gmClockClass_);
    json.add("gmClockAccuracy", gmClockAccuracy_);
    json.add("gmOffsetLogVariance", gmOffsetLogVariance_);
    json.add("gmPriority1", gmPriority1_);
    json.add("gmPriority2", gmPriority2_);
    // In the order of the names: Port10 stands before Port2.
    std::map<std::string, const tPortMetaData*> portsByName;
    for (const auto& [number, port] : ports_) {
        portsByName["Port" + std::to_string(number)] = &port;
    }
    for (const auto& [name, port] : portsByName) {
        json.addRaw(name, portJson(*port));
    }
    return std::move(json).finish();
}

} // namespace zekelVantel
