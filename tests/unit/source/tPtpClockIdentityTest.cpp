#include "tPtpClockIdentity.h"

#include <gtest/gtest.h>

#include "support/Octets.h"

using zekelVantel::tPtpClockIdentity;

namespace {

Octets raw(const tPtpClockIdentity& identity) {
    return {identity.octets().begin(), identity.octets().end()};
}

TEST(PtpClockIdentityTest, IsZeroByDefault) {
    const tPtpClockIdentity identity;
    EXPECT_EQ(raw(identity), Octets(8, 0));
    EXPECT_EQ(serialized(identity), Octets(8, 0));
    EXPECT_EQ(identity.size(), 8U);
}

TEST(PtpClockIdentityTest, NumberPutsItsHighestOctetFirst) {
    const tPtpClockIdentity identity(0x0011223344556677);
    EXPECT_EQ(raw(identity), octets("00 11 22 33 44 55 66 77"));
    EXPECT_EQ(serialized(identity), octets("00 11 22 33 44 55 66 77"));
}

TEST(PtpClockIdentityTest, NumberKeepsItsHighBits) {
    EXPECT_EQ(serialized(tPtpClockIdentity(0xFEDCBA9876543210)), octets("FE DC BA 98 76 54 32 10"));
    EXPECT_EQ(serialized(tPtpClockIdentity(0xFFFFFFFFFFFFFFFF)), Octets(8, 0xFF));
}

TEST(PtpClockIdentityTest, OctetsAreReadAsTheyStand) {
    const auto identity = readFrom<tPtpClockIdentity>(octets("00 1B 19 FF FE 81 92 A3"));
    EXPECT_EQ(raw(identity), octets("00 1B 19 FF FE 81 92 A3"));
    EXPECT_EQ(serialized(identity), octets("00 1B 19 FF FE 81 92 A3"));
}

} // namespace
