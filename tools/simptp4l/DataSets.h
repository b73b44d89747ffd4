/// @file
/// The data sets that the simulator answers with, as management TLVs.
#pragma once

#include "Fields.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace simptp4l {

/// A portState.
constexpr int listeningState = 4;

/// Everything that a data set of one port may show; of the clock when port is 0.
struct View {
    std::uint64_t clockIdentity = 0;
    unsigned port = 0;
    unsigned numberPorts = 0;
    int portState = 0;
    std::string interface;

    bool gmPresent = false;
    std::uint64_t gmIdentity = 0;
    std::int64_t masterOffset = 0;
    std::int64_t ingressTime = 0;

    int domainNumber = 0;
    int flags = 0;
    int priority1 = 0;
    int priority2 = 0;
    int clockClass = 0;
    int clockAccuracy = 0;
    int offsetScaledLogVariance = 0;
    int logMinDelayReqInterval = 0;
    int logAnnounceInterval = 0;
    int announceReceiptTimeout = 0;
    int logSyncInterval = 0;
    int delayMechanism = 0;
    int logMinPdelayReqInterval = 0;
    int neighborPropDelayThresh = 0;
    int timestamping = 0;
};

struct DataSet {
    std::string_view name; ///< as scripts and pmc call it
    std::size_t dataSize;  ///< octets of data after the managementId; the least where it varies
    FieldList (*tlv)(const View&); ///< the whole TLV, lengthField filled in
    std::uint16_t id;              ///< managementId
    bool perPort;                  ///< answered once per port; else once by the clock
    bool varies;                   ///< the size of the data depends on its content
};

/// The six data sets that the simulator knows; nullptr when it is none of them.
const DataSet* findDataSet(std::uint16_t id);
const DataSet* findDataSet(std::string_view name);

/// The TLV MANAGEMENT_ERROR_STATUS.
FieldList errorStatus(std::uint16_t managementId, std::uint16_t errorId);

/// A value as it goes into a field: negative numbers as two's complement.
constexpr std::uint64_t raw(std::int64_t value) {
    return static_cast<std::uint64_t>(value);
}

} // namespace simptp4l
