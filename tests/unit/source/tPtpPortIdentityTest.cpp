#include "tPtpPortIdentity.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpClockIdentity;
using zekelVantel::tPtpPortIdentity;

namespace {

TEST(PtpPortIdentityTest, IsZeroByDefault) {
    const tPtpPortIdentity identity;
    EXPECT_EQ(serialized(identity.clockIdentity()), Octets(8, 0));
    EXPECT_EQ(identity.portNumber(), 0U);
    EXPECT_EQ(identity.size(), 10U);
    EXPECT_EQ(serialized(identity), Octets(10, 0));
}

TEST(PtpPortIdentityTest, IsBuiltFromClockIdentityAndPortNumber) {
    const tPtpPortIdentity identity(tPtpClockIdentity(0x8A9BACBDCEDFE0F1), 0xC3D4);
    EXPECT_EQ(serialized(identity), octets("8A9BACBDCEDFE0F1 C3D4"));
}

TEST(PtpPortIdentityTest, FieldsAreReadInWireOrder) {
    const auto identity = readFrom<tPtpPortIdentity>(octets("001B19FFFE8192A3 8142"));
    EXPECT_EQ(serialized(identity.clockIdentity()), octets("001B19FFFE8192A3"));
    EXPECT_EQ(identity.portNumber(), 0x8142U);
    EXPECT_EQ(serialized(identity), octets("001B19FFFE8192A3 8142"));
}

} // namespace
