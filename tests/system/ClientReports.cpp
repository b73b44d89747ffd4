#include "system/ClientReports.h"

#include <cinttypes>
#include <cstdio>

using namespace zekelVantel;

namespace {

template <typename... Values>
std::string formatted(const char* format, Values... values) {
    char text[64];
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
    std::snprintf(text, sizeof(text), format, values...);
#pragma GCC diagnostic pop
    return text;
}

template <typename Integer>
std::string decimal(Integer value) {
    return std::to_string(value);
}

std::string textOf(const tPtpClockIdentity& identity) {
    const auto& o = identity.octets();
    return formatted("%02x%02x%02x.%02x%02x.%02x%02x%02x", o[0], o[1], o[2], o[3], o[4], o[5], o[6],
                     o[7]);
}

std::string textOf(const tPtpPortIdentity& identity) {
    return textOf(identity.clockIdentity()) + "-" + decimal(identity.portNumber());
}

std::string portStateName(std::uint8_t state) {
    static const char* const names[] = {"NONE",         "INITIALIZING", "FAULTY",      "DISABLED",
                                        "LISTENING",    "PRE_MASTER",   "MASTER",      "PASSIVE",
                                        "UNCALIBRATED", "SLAVE",        "GRAND_MASTER"};
    return state < std::size(names) ? names[state] : "?";
}

std::string timestampingName(std::uint8_t kind) {
    static const char* const names[] = {"SOFTWARE", "HARDWARE", "LEGACY_HW", "ONESTEP", "P2P1STEP"};
    return kind < std::size(names) ? names[kind] : "?";
}

} // namespace

Report reportOf(const tTimeStatus& data) {
    constexpr double scale = 2199023255552.0; // 2^41
    const auto& change = data.lastGmPhaseChange;
    return {
        {"master_offset", decimal(data.masterOffset)},
        {"ingress_time", decimal(data.ingressTime)},
        {"cumulativeScaledRateOffset", formatted("%+.9f", data.cumulativeScaledRateOffset / scale)},
        {"scaledLastGmPhaseChange", decimal(data.scaledLastGmPhaseChange)},
        {"gmTimeBaseIndicator", decimal(data.gmTimeBaseIndicator)},
        {"lastGmPhaseChange",
         formatted("0x%04x'%016" PRIx64 ".%04x", static_cast<unsigned>(change.nanosecondsMsb()),
                   std::uint64_t{change.nanosecondsLsb()},
                   static_cast<unsigned>(change.fractionalNanoseconds()))},
        {"gmPresent", data.gmPresent != 0 ? "true" : "false"},
        {"gmIdentity", textOf(data.gmIdentity)}};
}

Report reportOf(const tParentDataSet& data) {
    const auto& quality = data.grandmasterClockQuality;
    return {
        {"parentPortIdentity", textOf(data.parentPortIdentity)},
        {"parentStats", decimal(data.parentStats)},
        {"observedParentOffsetScaledLogVariance",
         formatted("0x%04x", data.observedParentOffsetScaledLogVariance)},
        {"observedParentClockPhaseChangeRate",
         formatted("0x%08x", static_cast<std::uint32_t>(data.observedParentClockPhaseChangeRate))},
        {"grandmasterPriority1", decimal(data.grandmasterPriority1)},
        {"gm.ClockClass", decimal(quality.clockClass())},
        {"gm.ClockAccuracy", formatted("0x%02x", quality.clockAccuracy())},
        {"gm.OffsetScaledLogVariance", formatted("0x%04x", quality.offsetScaledLogVariance())},
        {"grandmasterPriority2", decimal(data.grandmasterPriority2)},
        {"grandmasterIdentity", textOf(data.grandmasterIdentity)}};
}

Report reportOf(const tDefaultDataSet& data) {
    const auto& quality = data.clockQuality;
    return {{"twoStepFlag", decimal(data.flags & 1)},
            {"slaveOnly", decimal(data.flags >> 1 & 1)},
            {"numberPorts", decimal(data.numberPorts)},
            {"priority1", decimal(data.priority1)},
            {"clockClass", decimal(quality.clockClass())},
            {"clockAccuracy", formatted("0x%02x", quality.clockAccuracy())},
            {"offsetScaledLogVariance", formatted("0x%04x", quality.offsetScaledLogVariance())},
            {"priority2", decimal(data.priority2)},
            {"clockIdentity", textOf(data.clockIdentity)},
            {"domainNumber", decimal(data.domainNumber)}};
}

Report reportOf(const tPortDataSet& data) {
    return {{"portIdentity", textOf(data.portIdentity)},
            {"portState", portStateName(data.portState)},
            {"logMinDelayReqInterval", decimal(data.logMinDelayReqInterval)},
            {"peerMeanPathDelay", decimal(data.peerMeanPathDelay >> 16)},
            {"logAnnounceInterval", decimal(data.logAnnounceInterval)},
            {"announceReceiptTimeout", decimal(data.announceReceiptTimeout)},
            {"logSyncInterval", decimal(data.logSyncInterval)},
            {"delayMechanism", decimal(data.delayMechanism)},
            {"logMinPdelayReqInterval", decimal(data.logMinPdelayReqInterval)},
            {"versionNumber", decimal(data.versionNumber)}};
}

Report reportOf(const tPortDataSetNp& data) {
    return {{"neighborPropDelayThresh", decimal(data.neighborPropDelayThresh)},
            {"asCapable", decimal(data.asCapable)}};
}

Report reportOf(const tPortProperties& data) {
    return {{"portIdentity", textOf(data.portIdentity)},
            {"portState", portStateName(data.portState)},
            {"timestamping", timestampingName(data.timestamping)},
            {"interface", data.interface.text()}};
}
