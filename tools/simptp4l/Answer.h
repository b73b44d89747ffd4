/// @file
/// From a planned answer to its octets.
#pragma once

#include "DataSets.h"
#include "Fields.h"
#include "Plan.h"
#include "Random.h"
#include "Request.h"

#include <cstdint>
#include <vector>

namespace simptp4l {

/// Header and management part of a message before the TLV: 48 octets.
struct Envelope {
    std::uint8_t transportSpecific = 0;
    std::uint8_t domainNumber = 0;
    PortIdentity source;
    PortIdentity target;
    std::uint16_t sequenceId = 0;
    std::uint8_t boundaryHops = 0;
    std::uint8_t actionField = 0;
};

/// The fields of an envelope, with messageLength for a TLV of that size.
FieldList headerFields(const Envelope& envelope, std::size_t tlvSize);

/// @param view   what the answering port shows; its port and interface are those of the answer
/// @param random source of garbage
Octets encodeAnswer(const Answer& answer, const Request& request, View view,
                    std::uint8_t transportSpecific, const std::vector<Override>& overrides,
                    Random& random);

} // namespace simptp4l
