/// @file
#pragma once

#include <cstdint>

#include "tPtpTlv.h"

namespace zekelVantel {

/// managementId, IEEE 1588-2008 table 40 and linuxptp's own.
enum class tManagementId : std::uint16_t {
    defaultDataSet = 0x2000,
    parentDataSet = 0x2002,
    portDataSet = 0x2004,
    timeStatusNp = 0xC000,
    portDataSetNp = 0xC002,
    portPropertiesNp = 0xC004,
};

/// The head of a management TLV, IEEE 1588-2008 15.5.2: 6 octets. Read field by field.
class tPtpMgmtTlv : public tPtpTlv {
public:
    /// Octets of a TLV that its lengthField does not count.
    static constexpr std::uint32_t uncounted = 4;

    tPtpMgmtTlv() = default;

    void deserialize(tMsgBuffer& buffer, zeerr::Status& status) override;
    void serialize(tMsgBuffer& buffer, zeerr::Status& status) const override;
    std::uint32_t size() const override;

    std::uint16_t managementId() const { return managementId_; }

    template <typename Self, typename Visitor>
    static void visitFields(Self& self, Visitor visit) {
        tPtpTlv::visitFields(self, visit);
        visit(self.managementId_);
    }

protected:
    /// @param dataSize octets of the data field, which the lengthField counts.
    tPtpMgmtTlv(tManagementId managementId, std::uint32_t dataSize);

private:
    std::uint16_t managementId_ = 0;
};

} // namespace zekelVantel
