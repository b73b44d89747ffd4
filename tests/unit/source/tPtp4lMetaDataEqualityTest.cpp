#include "tPtp4lMetaData.h"

#include <functional>
#include <ostream>
#include <utility>

#include <gtest/gtest.h>

#include "support/PtpSituation.h"

using zekelVantel::tPtp4lMetaData;
using zekelVantel::tPtpClockIdentity;

namespace {

struct Change {
    const char* name;
    std::function<void(PtpSituation&)> apply;
};

void PrintTo(const Change& change, std::ostream* out) {
    *out << change.name;
}

std::string nameOfField(const testing::TestParamInfo<Change>& change) {
    return change.param.name;
}

PtpSituation someSituation() {
    PtpSituation situation;
    situation.parent = parentDataSet("001B21FFFE0A0B0C 0001 00 00 FFFF 7FFFFFFF"
                                     "80 06 21 4E5D 7F 001B21FFFE0A0B0C");
    situation.local = defaultDataSet("01 00 0002 80 F8 22 1234 81 AABBCCFFFEDDEEFF 18 00");
    addPort(situation, 1, "eth0");
    addPort(situation, 2, "eth1");
    return situation;
}

tPtp4lMetaData changed(const Change& change) {
    PtpSituation situation = someSituation();
    change.apply(situation);
    return metaDataOf(situation);
}

class PtpMetaDataSeesTest : public testing::TestWithParam<Change> {};
class PtpMetaDataIgnoresTest : public testing::TestWithParam<Change> {};

TEST_P(PtpMetaDataSeesTest, Change) {
    const tPtp4lMetaData before = metaDataOf(someSituation());
    const tPtp4lMetaData after = changed(GetParam());
    EXPECT_TRUE(before != after);
    EXPECT_TRUE(after != before);
    EXPECT_FALSE(before == after);
    EXPECT_FALSE(after == before);
}

TEST_P(PtpMetaDataIgnoresTest, Change) {
    const tPtp4lMetaData before = metaDataOf(someSituation());
    const tPtp4lMetaData after = changed(GetParam());
    EXPECT_TRUE(before == after);
    EXPECT_FALSE(before != after);
}

void setGrandmaster(PtpSituation& situation, std::uint64_t identity) {
    situation.parent.grandmasterIdentity = tPtpClockIdentity(identity);
}

void removeLastPort(PtpSituation& situation) {
    situation.portDataSets.pop_back();
    situation.portDataSetsNp.pop_back();
    situation.portProperties.pop_back();
}

const Change fieldsThatCount[] = {
    {"GrandmasterFirstOctet", [](auto& s) { setGrandmaster(s, 0x011B21FFFE0A0B0C); }},
    {"GrandmasterFourthOctet", [](auto& s) { setGrandmaster(s, 0x001B21FEFE0A0B0C); }},
    {"GrandmasterFifthOctet", [](auto& s) { setGrandmaster(s, 0x001B21FFFF0A0B0C); }},
    {"GrandmasterLastOctet", [](auto& s) { setGrandmaster(s, 0x001B21FFFE0A0B0D); }},
    {"GrandmasterClass",
     [](auto& s) { s.parent.grandmasterClockQuality = clockQuality("07214E5D"); }},
    {"GrandmasterAccuracy",
     [](auto& s) { s.parent.grandmasterClockQuality = clockQuality("06224E5D"); }},
    {"GrandmasterVariance",
     [](auto& s) { s.parent.grandmasterClockQuality = clockQuality("06214E5E"); }},
    {"GrandmasterPriority1", [](auto& s) { s.parent.grandmasterPriority1 = 129; }},
    {"GrandmasterPriority2", [](auto& s) { s.parent.grandmasterPriority2 = 128; }},
    {"LocalIdentity", [](auto& s) { s.local.clockIdentity = tPtpClockIdentity(1); }},
    {"LocalClass", [](auto& s) { s.local.clockQuality = clockQuality("F9221234"); }},
    {"LocalAccuracy", [](auto& s) { s.local.clockQuality = clockQuality("F8211234"); }},
    {"LocalVariance", [](auto& s) { s.local.clockQuality = clockQuality("F8221235"); }},
    {"LocalPriority1", [](auto& s) { s.local.priority1 = 127; }},
    {"LocalPriority2", [](auto& s) { s.local.priority2 = 128; }},
    {"Domain", [](auto& s) { s.local.domainNumber = 0; }},
    {"OnePortMore", [](auto& s) { addPort(s, 3); }},
    {"OnePortLess", [](auto& s) { removeLastPort(s); }},
    {"PortNumber", [](auto& s) { s.portDataSets[1].portIdentity = portIdentity(3); }},
    {"PortState", [](auto& s) { s.portDataSets[1].portState = 9; }},
    {"AsCapable", [](auto& s) { s.portDataSetsNp[1].asCapable = 1; }},
    {"AnnounceInterval", [](auto& s) { s.portDataSets[1].logAnnounceInterval = 1; }},
    {"SyncInterval", [](auto& s) { s.portDataSets[1].logSyncInterval = -1; }},
    {"PdelayInterval", [](auto& s) { s.portDataSets[1].logMinPdelayReqInterval = 1; }},
    {"Threshold", [](auto& s) { s.portDataSetsNp[1].neighborPropDelayThresh = 1; }},
    {"Interface", [](auto& s) { s.portProperties[1] = portProperties("eth2"); }},
    {"FirstPortToo", [](auto& s) { s.portDataSets[0].portState = 9; }},
};

const Change fieldsThatDoNot[] = {
    {"Nothing", [](auto&) {}},
    {"ParentPort", [](auto& s) { s.parent.parentPortIdentity = portIdentity(9); }},
    {"ParentStatistics",
     [](auto& s) {
         s.parent.parentStats = 1;
         s.parent.observedParentOffsetScaledLogVariance = 0;
         s.parent.observedParentClockPhaseChangeRate = 0;
     }},
    {"ReservedOctets",
     [](auto& s) {
         s.parent.reserved = 1;
         s.local.reserved1 = 1;
         s.local.reserved2 = 1;
     }},
    {"Flags", [](auto& s) { s.local.flags = 0; }},
    {"NumberOfPortsTheDaemonSpeaksOf", [](auto& s) { s.local.numberPorts = 7; }},
    {"ClockOfAPort",
     [](auto& s) {
         s.portDataSets[0].portIdentity = {tPtpClockIdentity(1), 1};
     }},
    {"DelayOfAPort",
     [](auto& s) {
         s.portDataSets[0].logMinDelayReqInterval = 1;
         s.portDataSets[0].peerMeanPathDelay = 1;
         s.portDataSets[0].announceReceiptTimeout = 1;
         s.portDataSets[0].delayMechanism = 1;
         s.portDataSets[0].versionNumber = 1;
     }},
    {"TimestampingAndStateOfThePortProperties",
     [](auto& s) {
         s.portProperties[0].timestamping = 2;
         s.portProperties[0].portState = 2;
         s.portProperties[0].portIdentity = portIdentity(9);
     }},
    {"OrderOfTheAnswers",
     [](auto& s) {
         std::swap(s.portDataSets[0], s.portDataSets[1]);
         std::swap(s.portDataSetsNp[0], s.portDataSetsNp[1]);
         std::swap(s.portProperties[0], s.portProperties[1]);
     }},
};

INSTANTIATE_TEST_SUITE_P(EachField, PtpMetaDataSeesTest, testing::ValuesIn(fieldsThatCount),
                         nameOfField);
INSTANTIATE_TEST_SUITE_P(EachField, PtpMetaDataIgnoresTest, testing::ValuesIn(fieldsThatDoNot),
                         nameOfField);

TEST(PtpMetaDataEqualityTest, FreshObjectsAreEqual) {
    EXPECT_TRUE(tPtp4lMetaData() == tPtp4lMetaData());
    EXPECT_FALSE(tPtp4lMetaData() != tPtp4lMetaData());
}

TEST(PtpMetaDataEqualityTest, FilledObjectDiffersFromAFreshOne) {
    EXPECT_TRUE(metaDataOf(someSituation()) != tPtp4lMetaData());
}

TEST(PtpMetaDataEqualityTest, AccuraciesWithoutANameAreTheSame) {
    PtpSituation one;
    one.local.clockQuality = clockQuality("00320000");
    PtpSituation other;
    other.local.clockQuality = clockQuality("00FF0000");
    EXPECT_TRUE(metaDataOf(one) == metaDataOf(other));
}

TEST(PtpMetaDataEqualityTest, CopiesAreEqualAndLiveApart) {
    const tPtp4lMetaData original = metaDataOf(someSituation());
    tPtp4lMetaData copy(original);
    tPtp4lMetaData assigned;
    assigned = original;
    EXPECT_TRUE(copy == original);
    EXPECT_TRUE(assigned == original);
    EXPECT_EQ(copy.toJson(), original.toJson());
    copy.takeLocalClock({});
    EXPECT_TRUE(copy != original);
    EXPECT_TRUE(assigned == original);
}

} // namespace
