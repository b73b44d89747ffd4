#include "DataSets.h"

namespace simptp4l {
namespace {

/// Octets before the part that lengthField counts.
constexpr std::size_t tlvHead = 4;

FieldList withHead(std::uint16_t id, const FieldList& data) {
    FieldList tlv{{"tlvType", 2, 1}, {"lengthField", 2, 0}, {"managementId", 2, id}};
    tlv.insert(tlv.end(), data.begin(), data.end());
    assign(tlv, "lengthField", size(tlv) - tlvHead);
    return tlv;
}

FieldList timeStatus(const View& view) {
    return withHead(0xC000, {{"masterOffset", 8, raw(view.masterOffset)},
                             {"ingressTime", 8, raw(view.ingressTime)},
                             {"cumulativeScaledRateOffset", 4, 0},
                             {"scaledLastGmPhaseChange", 4, 0},
                             {"gmTimeBaseIndicator", 2, 0},
                             {"lastGmPhaseChange.nanosecondsMsb", 2, 0},
                             {"lastGmPhaseChange.nanosecondsLsb", 8, 0},
                             {"lastGmPhaseChange.fractionalNanoseconds", 2, 0},
                             {"gmPresent", 4, view.gmPresent ? 1U : 0U},
                             {"gmIdentity", 8, view.gmIdentity}});
}

/// A grandmaster's own values are those of a clock locked to a primary reference; without one the
/// clock is its own grandmaster.
FieldList parentDataSet(const View& view) {
    const bool gm = view.gmPresent;
    return withHead(
        0x2002, {{"parentPortIdentity.clockIdentity", 8, view.gmIdentity},
                 {"parentPortIdentity.portNumber", 2, gm ? 1U : 0U},
                 {"parentStats", 1, 0},
                 {"reserved", 1, 0},
                 {"observedParentOffsetScaledLogVariance", 2, 0xFFFF},
                 {"observedParentClockPhaseChangeRate", 4, 0x7FFFFFFF},
                 {"grandmasterPriority1", 1, gm ? 128 : raw(view.priority1)},
                 {"grandmasterClockQuality.clockClass", 1, gm ? 6 : raw(view.clockClass)},
                 {"grandmasterClockQuality.clockAccuracy", 1, gm ? 0x21 : raw(view.clockAccuracy)},
                 {"grandmasterClockQuality.offsetScaledLogVariance", 2,
                  gm ? 0x4E5D : raw(view.offsetScaledLogVariance)},
                 {"grandmasterPriority2", 1, gm ? 128 : raw(view.priority2)},
                 {"grandmasterIdentity", 8, view.gmIdentity}});
}

FieldList defaultDataSet(const View& view) {
    return withHead(0x2000,
                    {{"flags", 1, raw(view.flags)},
                     {"reserved1", 1, 0},
                     {"numberPorts", 2, view.numberPorts},
                     {"priority1", 1, raw(view.priority1)},
                     {"clockQuality.clockClass", 1, raw(view.clockClass)},
                     {"clockQuality.clockAccuracy", 1, raw(view.clockAccuracy)},
                     {"clockQuality.offsetScaledLogVariance", 2, raw(view.offsetScaledLogVariance)},
                     {"priority2", 1, raw(view.priority2)},
                     {"clockIdentity", 8, view.clockIdentity},
                     {"domainNumber", 1, raw(view.domainNumber)},
                     {"reserved2", 1, 0}});
}

FieldList portDataSet(const View& view) {
    return withHead(0x2004, {{"portIdentity.clockIdentity", 8, view.clockIdentity},
                             {"portIdentity.portNumber", 2, view.port},
                             {"portState", 1, raw(view.portState)},
                             {"logMinDelayReqInterval", 1, raw(view.logMinDelayReqInterval)},
                             {"peerMeanPathDelay", 8, 0},
                             {"logAnnounceInterval", 1, raw(view.logAnnounceInterval)},
                             {"announceReceiptTimeout", 1, raw(view.announceReceiptTimeout)},
                             {"logSyncInterval", 1, raw(view.logSyncInterval)},
                             {"delayMechanism", 1, raw(view.delayMechanism)},
                             {"logMinPdelayReqInterval", 1, raw(view.logMinPdelayReqInterval)},
                             {"versionNumber", 1, 2}});
}

FieldList portDataSetNp(const View& view) {
    return withHead(0xC002, {{"neighborPropDelayThresh", 4, raw(view.neighborPropDelayThresh)},
                             {"asCapable", 4, view.portState == listeningState ? 0U : 1U}});
}

/// ptp4l makes lengthField even by one octet of padding after the text.
FieldList portProperties(const View& view) {
    FieldList data{{"portIdentity.clockIdentity", 8, view.clockIdentity},
                   {"portIdentity.portNumber", 2, view.port},
                   {"portState", 1, raw(view.portState)},
                   {"timestamping", 1, raw(view.timestamping)},
                   {"interface.lengthField", 1, view.interface.size()}};
    for (char letter : view.interface) {
        data.push_back({"", 1, static_cast<unsigned char>(letter)});
    }
    if (size(data) % 2 != 0) {
        data.push_back({"", 1, 0});
    }
    return withHead(0xC004, data);
}

constexpr DataSet dataSets[] = {
    {"TIME_STATUS_NP", 50, timeStatus, 0xC000, false, false},
    {"PARENT_DATA_SET", 32, parentDataSet, 0x2002, false, false},
    {"DEFAULT_DATA_SET", 20, defaultDataSet, 0x2000, false, false},
    {"PORT_DATA_SET", 26, portDataSet, 0x2004, true, false},
    {"PORT_DATA_SET_NP", 8, portDataSetNp, 0xC002, true, false},
    {"PORT_PROPERTIES_NP", 13, portProperties, 0xC004, true, true},
};

} // namespace

const DataSet* findDataSet(std::uint16_t id) {
    for (const DataSet& entry : dataSets) {
        if (entry.id == id) {
            return &entry;
        }
    }
    return nullptr;
}

const DataSet* findDataSet(std::string_view name) {
    for (const DataSet& entry : dataSets) {
        if (entry.name == name) {
            return &entry;
        }
    }
    return nullptr;
}

FieldList errorStatus(std::uint16_t managementId, std::uint16_t errorId) {
    return {{"tlvType", 2, 2},
            {"lengthField", 2, 8},
            {"managementErrorId", 2, errorId},
            {"managementId", 2, managementId},
            {"reserved", 4, 0}};
}

} // namespace simptp4l
