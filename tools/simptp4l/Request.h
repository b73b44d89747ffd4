/// @file
/// Management requests as they come in.
#pragma once

#include "Fields.h"

#include <cstdint>
#include <optional>
#include <string>

namespace simptp4l {

enum class RequestAction : std::uint8_t { get = 0, set = 1, command = 3 };

struct PortIdentity {
    std::uint64_t clockIdentity = 0;
    std::uint16_t portNumber = 0;
};

struct Request {
    PortIdentity source;
    PortIdentity target;
    std::uint16_t sequenceId = 0;
    std::uint8_t startingBoundaryHops = 0;
    std::uint8_t boundaryHops = 0;
    RequestAction action = RequestAction::get;
    std::uint16_t managementId = 0;
    std::size_t dataSize = 0; ///< octets after the managementId, by lengthField
};

/// What a request must carry to be for this clock.
struct Acceptance {
    std::uint8_t transportSpecific = 0;
    std::uint8_t domainNumber = 0;
    std::uint64_t clockIdentity = 0;
    /// The TLV must end within messageLength, and messageLength within the datagram, as ptp4l wants
    /// it. Else messageLength is not looked at.
    bool strictPadding = false;
    /// transportSpecific must be one that IEEE 802.1AS knows.
    bool onlyIeee8021As = false;
};

/// Reads a datagram.
/// @param ignored receives the reason when the result is empty: such a request gets no answer.
std::optional<Request> readRequest(const Octets& octets, const Acceptance& acceptance,
                                   std::string& ignored);

} // namespace simptp4l
