#include "tPtpPortIdentity.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpClockIdentity;
using zekelVantel::tPtpPortIdentity;

namespace tPtpPortIdentityTest {

const Octets before = octets("01 02 03 04 05 06 07 08 09 0A");
const Octets next = octets("F1 F2 F3 F4 F5 F6 F7 F8 F9 FA");

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

TEST(PtpPortIdentityTest, ReadsTenOctetsAndNoMore) {
    EXPECT_EQ(octetsConsumed<tPtpPortIdentity>(Octets(13, 0x42)), 10U);
}

TEST(PtpPortIdentityTest, IdentityCutAnywhereChangesNothing) {
    expectAllOrNothing<tPtpPortIdentity>(before, next);
}

TEST(PtpPortIdentityTest, OnlyAnErrorStopsReading) {
    expectOnlyAnErrorStopsReading<tPtpPortIdentity>(before, next);
}

TEST(PtpPortIdentityTest, NoRoomIsEndOfData) {
    expectNoRoomIsEndOfData<tPtpPortIdentity>(next);
}

} // namespace tPtpPortIdentityTest
