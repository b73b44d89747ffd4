// Data sets with arbitrary fields: whatever a daemon says, the metadata is one JSON object that
// another parser reads back, member by member.
//
// The first octet is the number of ports. Then come the fields of the parent data set, of the
// default data set and of each port; the name of an interface is one octet of length and the text.

#include <algorithm>
#include <cstdio>
#include <set>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

#include "FuzzInput.h"
#include "tMsgBuffer.h"
#include "tPtp4lMetaData.h"

namespace {

using namespace zekelVantel;
using Json = nlohmann::ordered_json;
using Octets = std::vector<std::uint8_t>;

/// The next octets of the input.
Octets take(FuzzInput& input, std::size_t count) {
    Octets octets(count);
    std::generate(octets.begin(), octets.end(), [&] { return input.octet(); });
    return octets;
}

/// Reads a TLV from the octets of its data field.
template <typename Tlv>
typename Tlv::Data read(const Octets& data) {
    constexpr std::size_t headSize = 6;
    tMsgBuffer buffer;
    zeerr::LocalStatus status;
    std::copy(data.begin(), data.end(), buffer.data() + headSize);
    buffer.setLength(static_cast<std::uint32_t>(headSize + data.size()), status);
    Tlv tlv;
    tlv.deserialize(buffer, status);
    require(zeerr::isClean(status), "a whole data set is read");
    return tlv.data();
}

unsigned twoOctets(const Octets& octets, std::size_t at) {
    return static_cast<unsigned>(octets[at] << 8 | octets[at + 1]);
}

std::string hexadecimal(const Octets& octets, std::initializer_list<std::size_t> indexes) {
    std::string text;
    for (const std::size_t index : indexes) {
        char digits[4];
        std::snprintf(digits, sizeof(digits), "%s%02X", text.empty() ? "" : ":", octets[index]);
        text += digits;
    }
    return text;
}

/// The parser takes valid UTF-8 only; the names are octets.
std::string withoutHighOctets(std::string text) {
    for (char& octet : text) {
        if (static_cast<unsigned char>(octet) >= 0x80) {
            octet = '?';
        }
    }
    return text;
}

struct Port {
    Octets dataSet;
    Octets np;
    std::string interface;
};

struct Situation {
    Octets parent;
    Octets local;
    std::vector<Port> ports;
};

Situation takeSituation(FuzzInput& input) {
    Situation situation;
    const std::size_t ports = input.octet() % 8U;
    situation.parent = take(input, 32);
    situation.local = take(input, 20);
    for (std::size_t port = 0; port < ports; ++port) {
        const Octets dataSet = take(input, 26);
        const Octets np = take(input, 8);
        situation.ports.push_back({dataSet, np, input.text()});
    }
    return situation;
}

tPtp4lMetaData metaDataOf(const Situation& situation) {
    std::vector<tPortDataSet> dataSets;
    std::vector<tPortDataSetNp> dataSetsNp;
    std::vector<tPortProperties> properties;
    for (const Port& port : situation.ports) {
        dataSets.push_back(read<tPtp4lPortDataSetMgmtTlv>(port.dataSet));
        dataSetsNp.push_back(read<tPtp4lPortDataSetNpMgmtTlv>(port.np));
        Octets octets(13);
        octets[12] = static_cast<std::uint8_t>(port.interface.size());
        octets.insert(octets.end(), port.interface.begin(), port.interface.end());
        properties.push_back(read<tPtp4lPortPropertiesMgmtTlv>(octets));
    }
    tPtp4lMetaData metaData;
    zeerr::LocalStatus status;
    metaData.takeGrandmaster(read<tPtp4lParentDataSetMgmtTlv>(situation.parent));
    metaData.takeLocalClock(read<tPtp4lDefaultDataSetMgmtTlv>(situation.local));
    metaData.takePorts(dataSets, dataSetsNp, properties, status);
    require(zeerr::isClean(status), "lists of one length are taken");
    return metaData;
}

/// Takes a member off the front of an object.
Json takeFirst(Json& object, const std::string& key) {
    require(!object.empty() && object.begin().key() == key, "the members stand in their order");
    Json value = object.begin().value();
    object.erase(object.begin());
    return value;
}

void checkClocks(Json& json, const Octets& parent, const Octets& local) {
    const Octets grandmaster(parent.begin() + 24, parent.end());
    const Octets clock(local.begin() + 10, local.begin() + 18);
    require(takeFirst(json, "gmClockId") == hexadecimal(grandmaster, {0, 1, 2, 3, 4, 5, 6, 7}),
            "gmClockId");
    require(takeFirst(json, "gmMacAddress") == hexadecimal(grandmaster, {0, 1, 2, 5, 6, 7}),
            "gmMacAddress");
    require(takeFirst(json, "localClockId") == hexadecimal(clock, {0, 1, 2, 3, 4, 5, 6, 7}),
            "localClockId");
    require(takeFirst(json, "clockClass") == local[5], "clockClass");
    require(takeFirst(json, "clockAccuracy").is_string(), "clockAccuracy");
    require(takeFirst(json, "offsetLogVariance") == twoOctets(local, 7), "offsetLogVariance");
    require(takeFirst(json, "priority1") == local[4], "priority1");
    require(takeFirst(json, "priority2") == local[9], "priority2");
    require(takeFirst(json, "domainNumber") == local[18], "domainNumber");
    require(takeFirst(json, "gmClockClass") == parent[19], "gmClockClass");
    require(takeFirst(json, "gmClockAccuracy").is_string(), "gmClockAccuracy");
    require(takeFirst(json, "gmOffsetLogVariance") == twoOctets(parent, 21), "gmOffsetLogVariance");
    require(takeFirst(json, "gmPriority1") == parent[18], "gmPriority1");
    require(takeFirst(json, "gmPriority2") == parent[23], "gmPriority2");
}

void checkPort(Json json, const Port& port) {
    const auto interval = [&](std::size_t at) {
        return static_cast<std::int8_t>(port.dataSet[at]);
    };
    const bool capable = std::any_of(port.np.begin() + 4, port.np.end(),
                                     [](std::uint8_t octet) { return octet != 0; });
    const std::string name = port.interface.substr(0, port.interface.find('\0'));
    const bool named = port.dataSet[10] >= 1 && port.dataSet[10] <= 10;
    require(takeFirst(json, "portState").get<std::string>().empty() != named, "portState");
    require(takeFirst(json, "asCapable") == capable, "asCapable");
    require(takeFirst(json, "logSyncInterval") == interval(22), "logSyncInterval");
    require(takeFirst(json, "logAnnounceInterval") == interval(20), "logAnnounceInterval");
    require(takeFirst(json, "logPdelayInterval") == interval(24), "logPdelayInterval");
    require(takeFirst(json, "interface") == withoutHighOctets(name), "interface");
    require(takeFirst(json, "neighborPropDelayThreshold") ==
                (std::uint32_t{twoOctets(port.np, 0)} << 16 | twoOctets(port.np, 2)),
            "neighborPropDelayThreshold");
    require(json.empty(), "a port has no other members");
}

void checkPorts(Json& json, const std::vector<Port>& ports) {
    std::string last;
    std::set<std::string> seen;
    while (!json.empty()) {
        const std::string key = json.begin().key();
        const auto found = std::find_if(ports.rbegin(), ports.rend(), [&](const Port& port) {
            return key == "Port" + std::to_string(twoOctets(port.dataSet, 8));
        });
        require(found != ports.rend() && last < key, "the ports stand in the order of their names");
        checkPort(takeFirst(json, key), *found);
        last = key;
        seen.insert(key);
    }
    for (const Port& port : ports) {
        require(seen.count("Port" + std::to_string(twoOctets(port.dataSet, 8))) == 1,
                "no port is left out");
    }
}

} // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    FuzzInput input(data, size);
    const Situation situation = takeSituation(input);
    const tPtp4lMetaData metaData = metaDataOf(situation);
    const std::string text = withoutHighOctets(metaData.toJson());
    require(text.find_first_of("\t\n\r\x7f") == std::string::npos,
            "control characters are escaped");

    Json json = Json::parse(text, nullptr, false);
    require(json.is_object(), "the metadata is one JSON object");
    checkClocks(json, situation.parent, situation.local);
    checkPorts(json, situation.ports);

    const tPtp4lMetaData copy = metaData;
    require(copy == metaData && copy.toJson() == metaData.toJson(), "a copy is equal");
    Situation changed = situation;
    changed.local[18] ^= 1U;
    require(metaDataOf(changed) != metaData, "another domain makes a difference");
    return 0;
}
