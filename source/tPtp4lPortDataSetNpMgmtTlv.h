/// @file
#pragma once

#include <cstdint>

#include "tPtpMgmtTlv.h"

namespace zekelVantel {

/// linuxptp `struct port_ds_np`: the IEEE 802.1AS part of one port.
struct tPortDataSetNp {
    std::uint32_t neighborPropDelayThresh = 0; ///< ns
    std::int32_t asCapable = 0;                ///< not 0: capable

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        visit(self.neighborPropDelayThresh, self.asCapable);
    }
};

/// PORT_DATA_SET_NP: 14 octets. Its data is read all or nothing.
class tPtp4lPortDataSetNpMgmtTlv : public tPtpMgmtTlv {
public:
    using Data = tPortDataSetNp;

    tPtp4lPortDataSetNpMgmtTlv();

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    const Data& data() const { return data_; }
    std::uint32_t neighborPropDelayThresh() const { return data_.neighborPropDelayThresh; }
    std::int32_t asCapable() const { return data_.asCapable; }

private:
    Data data_;
};

} // namespace zekelVantel
