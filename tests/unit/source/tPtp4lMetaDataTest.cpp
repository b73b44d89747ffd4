#include "tPtp4lMetaData.h"

#include <gtest/gtest.h>

#include "support/PtpSituation.h"

using zekelVantel::tPtp4lMetaData;

namespace {

constexpr char someGrandmaster[] = "001B21FFFE0A0B0C 0001 00 00 FFFF 7FFFFFFF"
                                   "80 06 21 4E5D 7F 001B21FFFE0A0B0C";
constexpr char someLocalClock[] = "01 00 0001 80 F8 FE FFFF 81 AABBCCFFFEDDEEFF 18 00";
constexpr char everyBitSet[] = "FFFFFFFFFFFFFFFF FFFF FF FF FFFF FFFFFFFF"
                               "FF FF FF FFFF FF FFFFFFFFFFFFFFFF";

// All members of the clocks, in the metadata of ones that nobody knows.
const std::string unknownClocks =
    R"({"gmClockId":"00:00:00:00:00:00:00:00",)"
    R"("gmMacAddress":"00:00:00:00:00:00",)"
    R"("localClockId":"00:00:00:00:00:00:00:00",)"
    R"("clockClass":0,"clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":0,)"
    R"("priority1":0,"priority2":0,"domainNumber":0,)"
    R"("gmClockClass":0,"gmClockAccuracy":"ACCURACY_UNKNOWN",)"
    R"("gmOffsetLogVariance":0,"gmPriority1":0,"gmPriority2":0)";

TEST(PtpMetaDataTest, DefaultsAreAClockThatNobodyKnows) {
    EXPECT_EQ(tPtp4lMetaData().toJson(), unknownClocks + "}");
}

TEST(PtpMetaDataTest, GrandmasterLeavesTheLocalClockAlone) {
    tPtp4lMetaData metaData;
    metaData.takeGrandmaster(parentDataSet(someGrandmaster));
    EXPECT_EQ(metaData.toJson(),
              R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C",)"
              R"("gmMacAddress":"00:1B:21:0A:0B:0C",)"
              R"("localClockId":"00:00:00:00:00:00:00:00",)"
              R"("clockClass":0,"clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":0,)"
              R"("priority1":0,"priority2":0,"domainNumber":0,)"
              R"("gmClockClass":6,"gmClockAccuracy":"WITHIN_100NS",)"
              R"("gmOffsetLogVariance":20061,"gmPriority1":128,"gmPriority2":127})");
}

TEST(PtpMetaDataTest, LocalClockLeavesTheGrandmasterAlone) {
    tPtp4lMetaData metaData;
    metaData.takeLocalClock(defaultDataSet(someLocalClock));
    EXPECT_EQ(metaData.toJson(),
              R"({"gmClockId":"00:00:00:00:00:00:00:00",)"
              R"("gmMacAddress":"00:00:00:00:00:00",)"
              R"("localClockId":"AA:BB:CC:FF:FE:DD:EE:FF",)"
              R"("clockClass":248,"clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":65535,)"
              R"("priority1":128,"priority2":129,"domainNumber":24,)"
              R"("gmClockClass":0,"gmClockAccuracy":"ACCURACY_UNKNOWN",)"
              R"("gmOffsetLogVariance":0,"gmPriority1":0,"gmPriority2":0})");
}

TEST(PtpMetaDataTest, OneSlavePortFollowsTheClocks) {
    PtpSituation situation;
    situation.parent = parentDataSet(someGrandmaster);
    situation.local = defaultDataSet(someLocalClock);
    situation.portDataSets = {
        portDataSet("AABBCCFFFEDDEEFF 0001 09 FD 0000000000010000 01 03 FD 02 FE 02")};
    situation.portDataSetsNp = {portDataSetNp("00000320 00000001")};
    situation.portProperties = {portProperties("eth0")};
    EXPECT_EQ(metaDataOf(situation).toJson(),
              R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C",)"
              R"("gmMacAddress":"00:1B:21:0A:0B:0C",)"
              R"("localClockId":"AA:BB:CC:FF:FE:DD:EE:FF",)"
              R"("clockClass":248,"clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":65535,)"
              R"("priority1":128,"priority2":129,"domainNumber":24,)"
              R"("gmClockClass":6,"gmClockAccuracy":"WITHIN_100NS",)"
              R"("gmOffsetLogVariance":20061,"gmPriority1":128,"gmPriority2":127,)"
              R"("Port1":{"portState":"PTP_SLAVE","asCapable":true,)"
              R"("logSyncInterval":-3,"logAnnounceInterval":1,"logPdelayInterval":-2,)"
              R"("interface":"eth0","neighborPropDelayThreshold":800}})");
}

TEST(PtpMetaDataTest, PortsStandInTheOrderOfTheirNames) {
    PtpSituation situation;
    addPort(situation, 1, "enp1s0");
    addPort(situation, 2, "enp2s0");
    addPort(situation, 10, "enp10s0");
    EXPECT_EQ(metaDataOf(situation).toJson(),
              unknownClocks +
                  R"(,"Port1":{"portState":"PTP_DISABLED","asCapable":false,)"
                  R"("logSyncInterval":0,"logAnnounceInterval":0,"logPdelayInterval":0,)"
                  R"("interface":"enp1s0","neighborPropDelayThreshold":0},)"
                  R"("Port10":{"portState":"PTP_DISABLED","asCapable":false,)"
                  R"("logSyncInterval":0,"logAnnounceInterval":0,"logPdelayInterval":0,)"
                  R"("interface":"enp10s0","neighborPropDelayThreshold":0},)"
                  R"("Port2":{"portState":"PTP_DISABLED","asCapable":false,)"
                  R"("logSyncInterval":0,"logAnnounceInterval":0,"logPdelayInterval":0,)"
                  R"("interface":"enp2s0","neighborPropDelayThreshold":0}})");
}

TEST(PtpMetaDataTest, EveryBitSetIsTheLargestUnsignedAndMinusOne) {
    PtpSituation situation;
    situation.parent = parentDataSet(everyBitSet);
    situation.local = defaultDataSet("FF FF FFFF FF FF FF FFFF FF FFFFFFFFFFFFFFFF FF FF");
    situation.portDataSets = {
        portDataSet("FFFFFFFFFFFFFFFF FFFF FF FF FFFFFFFFFFFFFFFF FF FF FF FF FF FF")};
    situation.portDataSetsNp = {portDataSetNp("FFFFFFFF FFFFFFFF")};
    situation.portProperties = {portProperties("")};
    EXPECT_EQ(metaDataOf(situation).toJson(),
              R"({"gmClockId":"FF:FF:FF:FF:FF:FF:FF:FF",)"
              R"("gmMacAddress":"FF:FF:FF:FF:FF:FF",)"
              R"("localClockId":"FF:FF:FF:FF:FF:FF:FF:FF",)"
              R"("clockClass":255,"clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":65535,)"
              R"("priority1":255,"priority2":255,"domainNumber":255,)"
              R"("gmClockClass":255,"gmClockAccuracy":"ACCURACY_UNKNOWN",)"
              R"("gmOffsetLogVariance":65535,"gmPriority1":255,"gmPriority2":255,)"
              R"("Port65535":{"portState":"","asCapable":true,)"
              R"("logSyncInterval":-1,"logAnnounceInterval":-1,"logPdelayInterval":-1,)"
              R"("interface":"","neighborPropDelayThreshold":4294967295}})");
}

TEST(PtpMetaDataTest, ExtremeIntervalsAndANumberlessPortAreRendered) {
    PtpSituation situation;
    situation.portDataSets = {
        portDataSet("0000000000000000 0000 00 00 0000000000000000 80 00 7F 00 80 00")};
    situation.portDataSetsNp = {portDataSetNp("80000000 80000000")};
    situation.portProperties = {portProperties("a")};
    EXPECT_EQ(metaDataOf(situation).toJson(),
              unknownClocks +
                  R"(,"Port0":{"portState":"","asCapable":true,)"
                  R"("logSyncInterval":127,"logAnnounceInterval":-128,"logPdelayInterval":-128,)"
                  R"("interface":"a","neighborPropDelayThreshold":2147483648}})");
}

TEST(PtpMetaDataTest, RenderingChangesNothing) {
    PtpSituation situation;
    situation.parent = parentDataSet(someGrandmaster);
    addPort(situation, 1);
    const tPtp4lMetaData metaData = metaDataOf(situation);
    const std::string once = metaData.toJson();
    EXPECT_EQ(metaData.toJson(), once);
    EXPECT_EQ(metaData, metaDataOf(situation));
}

} // namespace
