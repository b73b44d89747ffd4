// Arbitrary octets as a management message and a TLV. The first octet chooses the TLV and whether
// the status already holds a warning; the rest is the datagram. What was understood goes out again
// as it came in, but for what a sender has to set itself; what was not understood is an error that
// changes no data set.

#include <algorithm>
#include <memory>
#include <vector>

#include "FuzzInput.h"
#include "tMsgBuffer.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtMsg.h"

namespace {

using namespace zekelVantel;
using Octets = std::vector<std::uint8_t>;

constexpr std::size_t messageSize = 48;
constexpr std::size_t headSize = 6;
constexpr std::size_t textAt = messageSize + headSize + 12;
constexpr std::ptrdiff_t emptyPortProperties = 19;

enum Kind : unsigned { timeStatus, parent, defaults, port, portNp, portProperties, headOnly, end };

/// Octets of each TLV, in the order of Kind.
constexpr std::size_t freshSize[] = {56, 38, 26, 32, 14, emptyPortProperties, 6};

std::unique_ptr<tPtpMgmtTlv> makeTlv(unsigned kind) {
    switch (kind) {
    case timeStatus:
        return std::make_unique<tPtp4lTimeStatusMgmtTlv>();
    case parent:
        return std::make_unique<tPtp4lParentDataSetMgmtTlv>();
    case defaults:
        return std::make_unique<tPtp4lDefaultDataSetMgmtTlv>();
    case port:
        return std::make_unique<tPtp4lPortDataSetMgmtTlv>();
    case portNp:
        return std::make_unique<tPtp4lPortDataSetNpMgmtTlv>();
    case portProperties:
        return std::make_unique<tPtp4lPortPropertiesMgmtTlv>();
    default:
        return std::make_unique<tPtpMgmtTlv>();
    }
}

void fill(tMsgBuffer& buffer, const Octets& octets) {
    zeerr::LocalStatus status;
    std::copy(octets.begin(), octets.end(), buffer.data());
    buffer.setLength(static_cast<std::uint32_t>(octets.size()), status);
    require(zeerr::isClean(status), "a datagram fits");
}

Octets written(const iMsgSerializable& object) {
    tMsgBuffer buffer;
    zeerr::LocalStatus status;
    object.serialize(buffer, status);
    require(zeerr::isClean(status), "an object can be written");
    return {buffer.data(), buffer.data() + buffer.getLength()};
}

std::size_t sizeOnWire(unsigned kind, const Octets& datagram) {
    const std::size_t text =
        kind == portProperties && datagram.size() > textAt ? datagram[textAt] : 0U;
    return freshSize[kind] + text;
}

/// The message as it is to go out again: no flags, nothing in what is reserved.
Octets expectedMessage(const Octets& datagram) {
    Octets octets(datagram.begin(), datagram.begin() + messageSize);
    octets[1] &= 0x0f;
    for (const std::size_t reserved : {5U, 6U, 7U, 16U, 17U, 18U, 19U, 47U}) {
        octets[reserved] = 0;
    }
    return octets;
}

/// The TLV as it is to go out again: a name ends at its first zero, and its length is the sender's.
Octets expectedTlv(unsigned kind, const Octets& datagram) {
    const auto begin = datagram.begin() + messageSize;
    const auto size = static_cast<std::ptrdiff_t>(sizeOnWire(kind, datagram));
    Octets octets(begin, begin + size);
    if (kind == portProperties) {
        const bool padded = datagram[textAt] % 2 == 0;
        const std::ptrdiff_t lengthField = size - 4 + (padded ? 1 : 0);
        octets[2] = static_cast<std::uint8_t>(lengthField >> 8);
        octets[3] = static_cast<std::uint8_t>(lengthField & 0xff);
        octets.erase(std::find(octets.begin() + emptyPortProperties, octets.end(), 0),
                     octets.end());
        if (padded) {
            octets.push_back(0);
        }
    }
    return octets;
}

void checkUnderstood(unsigned kind, const Octets& datagram, const tPtpMgmtMsg& message,
                     const tPtpMgmtTlv& tlv) {
    const Octets messageOctets = written(message);
    require(messageOctets == expectedMessage(datagram), "a message goes out as it came in");
    const Octets tlvOctets = written(tlv);
    require(tlvOctets == expectedTlv(kind, datagram), "a TLV goes out as it came in");
    require(tlv.size() == sizeOnWire(kind, datagram), "a TLV knows its size");
    const std::size_t counted = tlv.size() - 4U;
    require(kind != portProperties || tlv.lengthField() == counted + counted % 2,
            "the lengthField follows the name");
}

void checkRefused(unsigned kind, const zeerr::Status& status, const tPtpMgmtTlv& tlv) {
    require(status.code == -52012 && status.json != nullptr, "a short datagram is end-of-data");
    const std::unique_ptr<tPtpMgmtTlv> fresh = makeTlv(kind);
    require(tlv.size() == fresh->size(), "a TLV that was not understood keeps its size");
    const Octets octets = written(tlv);
    const Octets expected = written(*fresh);
    require(kind == timeStatus || std::equal(octets.begin() + headSize, octets.end(),
                                             expected.begin() + headSize, expected.end()),
            "a data set that was not understood keeps its values");
}

void checkSecondReadDoesNothing(tMsgBuffer& buffer, zeerr::Status& status, tPtpMgmtMsg& message,
                                tPtpMgmtTlv& tlv) {
    const Octets before = written(message);
    const Octets tlvBefore = written(tlv);
    message.deserialize(buffer, status);
    tlv.deserialize(buffer, status);
    require(written(message) == before && written(tlv) == tlvBefore,
            "nothing is read once the status holds an error");
}

} // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    FuzzInput input(data, size);
    const unsigned choice = input.octet();
    const unsigned kind = choice % 0x80U % static_cast<unsigned>(end);
    const std::int32_t warning = choice >= 0x80U ? 1 : 0;
    const std::size_t length = std::min<std::size_t>(size > 0 ? size - 1 : 0, 1500);
    const Octets datagram(data + (size > 0 ? 1 : 0), data + (size > 0 ? 1 : 0) + length);

    tMsgBuffer buffer;
    fill(buffer, datagram);
    tPtpMgmtMsg message;
    const std::unique_ptr<tPtpMgmtTlv> tlv = makeTlv(kind);
    zeerr::LocalStatus status;
    status.code = warning;
    message.deserialize(buffer, status);
    tlv->deserialize(buffer, status);

    const bool whole = datagram.size() >= messageSize + sizeOnWire(kind, datagram);
    require(zeerr::isError(status) == !whole, "only a short datagram is refused");
    if (whole) {
        require(status.code == warning, "a warning stays");
        checkUnderstood(kind, datagram, message, *tlv);
    } else {
        checkRefused(kind, status, *tlv);
        checkSecondReadDoesNothing(buffer, status, message, *tlv);
    }
    return 0;
}
