/// @file
#pragma once

#include <cstdint>

#include "tPtpMgmtTlv.h"
#include "tPtpPortIdentity.h"
#include "tPtpText.h"

namespace zekelVantel {

/// linuxptp `struct port_properties_np`: how one port meets its network interface.
struct tPortProperties {
    tPtpPortIdentity portIdentity;
    std::uint8_t portState = 3;    ///< IEEE 1588-2008 table 8
    std::uint8_t timestamping = 0; ///< linuxptp `enum timestamp_type`
    tPtpText interface;

    static constexpr bool isVariable = true;

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.portIdentity, self.portState, self.timestamping, self.interface);
    }
};

/// PORT_PROPERTIES_NP: 19 octets and the interface name. Its data is read all or nothing.
///
/// [oddity pad-not-read] A TLV has an even length: behind a name of even length stands a pad octet.
/// It is written and counted in the lengthField, but not read and not part of size().
class tPtp4lPortPropertiesMgmtTlv : public tPtpMgmtTlv {
public:
    using Data = tPortProperties;

    tPtp4lPortPropertiesMgmtTlv();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const Data& data() const { return data_; }
    const tPtpPortIdentity& portIdentity() const { return data_.portIdentity; }
    std::uint8_t portState() const { return data_.portState; }
    std::uint8_t timestamping() const { return data_.timestamping; }
    const tPtpText& interface() const { return data_.interface; }

private:
    void updateLengthField();

    Data data_;
    bool padded_ = false;
};

} // namespace zekelVantel
