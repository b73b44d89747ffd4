#include "Answer.h"

#include <algorithm>

namespace simptp4l {
namespace {

/// Added to the port number of an answer that is to come from another port.
constexpr unsigned otherPortShift = 100;

/// The largest datagram the simulator sends.
constexpr std::int64_t maxLength = 65000;

Octets garbage(std::int64_t length, Random& random) {
    Octets octets;
    while (static_cast<std::int64_t>(octets.size()) < length) {
        octets.push_back(static_cast<std::uint8_t>(random.next() & 0xFF));
    }
    return octets;
}

void setLength(const Answer& answer, Octets& octets) {
    const std::int64_t exact =
        answer.exactLength.value_or(static_cast<std::int64_t>(octets.size()));
    const std::int64_t length = std::clamp<std::int64_t>(exact + answer.lengthChange, 0, maxLength);
    octets.resize(static_cast<std::size_t>(length));
}

Envelope envelopeFor(const Request& request, const View& view, std::uint8_t transportSpecific) {
    Envelope envelope;
    envelope.transportSpecific = transportSpecific;
    envelope.domainNumber = static_cast<std::uint8_t>(view.domainNumber);
    envelope.source = {view.clockIdentity, static_cast<std::uint16_t>(view.port)};
    envelope.target = request.source;
    envelope.sequenceId = request.sequenceId;
    envelope.boundaryHops =
        static_cast<std::uint8_t>(request.startingBoundaryHops - request.boundaryHops);
    // RESPONSE, or ACKNOWLEDGE for a COMMAND.
    envelope.actionField = request.action == RequestAction::command ? 4 : 2;
    return envelope;
}

} // namespace

FieldList headerFields(const Envelope& envelope, std::size_t tlvSize) {
    FieldList fields{{"transportSpecificAndMessageType", 1,
                      static_cast<unsigned>(envelope.transportSpecific << 4 | 13)},
                     {"versionPTP", 1, 2},
                     {"messageLength", 2, 0},
                     {"domainNumber", 1, envelope.domainNumber},
                     {"reserved1", 1, 0},
                     {"flagField", 2, 0},
                     {"correctionField", 8, 0},
                     {"reserved2", 4, 0},
                     {"sourcePortIdentity.clockIdentity", 8, envelope.source.clockIdentity},
                     {"sourcePortIdentity.portNumber", 2, envelope.source.portNumber},
                     {"sequenceId", 2, envelope.sequenceId},
                     {"controlField", 1, 4},
                     {"logMessageInterval", 1, 0x7F},
                     {"targetPortIdentity.clockIdentity", 8, envelope.target.clockIdentity},
                     {"targetPortIdentity.portNumber", 2, envelope.target.portNumber},
                     {"startingBoundaryHops", 1, envelope.boundaryHops},
                     {"boundaryHops", 1, envelope.boundaryHops},
                     {"actionField", 1, envelope.actionField},
                     {"reserved3", 1, 0}};
    assign(fields, "messageLength", size(fields) + tlvSize);
    return fields;
}

Octets encodeAnswer(const Answer& answer, const Request& request, View view,
                    std::uint8_t transportSpecific, const std::vector<Override>& overrides,
                    Random& random) {
    if (answer.garbage) {
        return garbage(*answer.garbage, random);
    }
    if (answer.otherPort) {
        view.port += otherPortShift;
    }
    const DataSet* dataSet = findDataSet(request.managementId);
    FieldList tlv;
    if (answer.error || dataSet == nullptr) {
        tlv = errorStatus(request.managementId, answer.error.value_or(0));
    } else {
        tlv = dataSet->tlv(view);
        apply(overrides, dataSet->name, answer.port, tlv);
    }
    FieldList header = headerFields(envelopeFor(request, view, transportSpecific), size(tlv));
    apply(overrides, "HEADER", answer.port, header);
    Octets octets;
    encode(header, octets);
    encode(tlv, octets);
    setLength(answer, octets);
    return octets;
}

} // namespace simptp4l
