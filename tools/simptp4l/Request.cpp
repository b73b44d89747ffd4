#include "Request.h"

#include "DataSets.h"

namespace simptp4l {
namespace {

constexpr std::size_t messageSize = 48;
constexpr std::size_t tlvSize = 6;
constexpr std::uint64_t anyClock = 0xFFFFFFFFFFFFFFFF;

std::uint64_t integerAt(const Octets& octets, std::size_t at, unsigned width) {
    std::uint64_t value = 0;
    for (unsigned index = 0; index < width; ++index) {
        value = value << 8 | octets[at + index];
    }
    return value;
}

std::uint16_t shortAt(const Octets& octets, std::size_t at) {
    return static_cast<std::uint16_t>(integerAt(octets, at, 2));
}

Request decode(const Octets& octets) {
    Request request;
    request.source = {integerAt(octets, 20, 8), shortAt(octets, 28)};
    request.sequenceId = shortAt(octets, 30);
    request.target = {integerAt(octets, 34, 8), shortAt(octets, 42)};
    request.startingBoundaryHops = octets[44];
    request.boundaryHops = octets[45];
    request.action = static_cast<RequestAction>(octets[46] & 0x0F);
    request.managementId = shortAt(octets, 52);
    return request;
}

/// @return why the header is not one to answer; empty when it is.
std::string checkHeader(const Octets& octets, const Acceptance& acceptance) {
    if (octets.size() < messageSize + tlvSize) {
        return "too short";
    }
    if ((octets[0] & 0x0F) != 13) {
        return "not a management message";
    }
    if ((octets[1] & 0x0F) != 2) {
        return "other versionPTP";
    }
    if (octets[0] >> 4 != acceptance.transportSpecific) {
        return "other transportSpecific";
    }
    if (acceptance.onlyIeee8021As && octets[0] >> 4 != 1 && octets[0] >> 4 != 2) {
        return "not of IEEE 802.1AS";
    }
    if (octets[4] != acceptance.domainNumber) {
        return "other domainNumber";
    }
    return {};
}

/// @param dataSize receives the octets after the managementId.
/// @return why the TLV is not one to answer; empty when it is.
std::string checkTlv(const Octets& octets, bool strict, std::size_t& dataSize) {
    const std::size_t limit = strict ? shortAt(octets, 2) : octets.size();
    const std::size_t length = shortAt(octets, 50);
    if (limit > octets.size()) {
        return "messageLength beyond the datagram";
    }
    if (shortAt(octets, 48) != 1) {
        return "not a management TLV";
    }
    if (length % 2 != 0 || length < 2) {
        return "bad lengthField";
    }
    if (messageSize + 4 + length > limit) {
        return "TLV beyond the message";
    }
    dataSize = length - 2;
    const DataSet* known = findDataSet(shortAt(octets, 52));
    // An empty TLV is the older way to ask.
    if (known == nullptr || dataSize == 0) {
        return {};
    }
    const bool fits = known->varies ? dataSize >= known->dataSize : dataSize == known->dataSize;
    return fits ? "" : "data of the wrong size";
}

std::string checkTarget(const Request& request, const Acceptance& acceptance) {
    switch (request.action) {
    case RequestAction::get:
    case RequestAction::set:
    case RequestAction::command:
        break;
    default:
        return "not a request";
    }
    const std::uint64_t clock = request.target.clockIdentity;
    return clock == anyClock || clock == acceptance.clockIdentity ? "" : "for another clock";
}

} // namespace

std::optional<Request> readRequest(const Octets& octets, const Acceptance& acceptance,
                                   std::string& ignored) {
    ignored = checkHeader(octets, acceptance);
    if (!ignored.empty()) {
        return std::nullopt;
    }
    std::size_t dataSize = 0;
    ignored = checkTlv(octets, acceptance.strictPadding, dataSize);
    if (!ignored.empty()) {
        return std::nullopt;
    }
    Request request = decode(octets);
    request.dataSize = dataSize;
    ignored = checkTarget(request, acceptance);
    if (!ignored.empty()) {
        return std::nullopt;
    }
    return request;
}

} // namespace simptp4l
