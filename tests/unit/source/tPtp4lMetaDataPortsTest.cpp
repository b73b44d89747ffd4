#include "tPtp4lMetaData.h"

#include <gmock/gmock.h>

#include "support/ErrorText.h"
#include "support/PtpSituation.h"

using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using zekelVantel::tPtp4lMetaData;

namespace {

constexpr char endWithoutPorts[] = R"(,"gmPriority2":0})";

/// Lists of these lengths, taken by an object that has a port already.
class PtpMetaDataPortsTest : public testing::Test {
protected:
    PtpMetaDataPortsTest() {
        PtpSituation before;
        addPort(before, 7);
        metaData = metaDataOf(before);
    }

    void takeLists(std::size_t dataSets, std::size_t dataSetsNp, std::size_t properties) {
        PtpSituation situation;
        addPort(situation, 1);
        addPort(situation, 2);
        situation.portDataSets.resize(dataSets);
        situation.portDataSetsNp.resize(dataSetsNp);
        situation.portProperties.resize(properties);
        metaData.takePorts(situation.portDataSets, situation.portDataSetsNp,
                           situation.portProperties, status);
    }

    tPtp4lMetaData metaData;
    zeerr::LocalStatus status;
};

TEST_F(PtpMetaDataPortsTest, ListsOfDifferentLengthsLeaveNoPortsAndAnError) {
    const std::size_t lengths[][3] = {{2, 2, 1}, {1, 2, 2}, {2, 1, 2}, {2, 1, 1}, {1, 2, 1},
                                      {1, 1, 2}, {0, 1, 1}, {1, 0, 1}, {1, 1, 0}, {1, 0, 0},
                                      {0, 1, 0}, {0, 0, 1}, {2, 1, 0}};
    const tPtp4lMetaData before = metaData;
    for (const auto& length : lengths) {
        metaData = before;
        zeerr::release(status);
        status.code = 0;
        takeLists(length[0], length[1], length[2]);
        EXPECT_EQ(status.code, -52024);
        EXPECT_EQ(textOf(status), R"({"error_constant":"zeoskerr_communicationsFault",)"
                                  R"("file":"tPtp4lMetaData","line":99,)"
                                  R"("component":"vantel_bc"})");
        EXPECT_EQ(metaData, tPtp4lMetaData());
        EXPECT_THAT(metaData.toJson(), EndsWith(endWithoutPorts));
    }
}

TEST_F(PtpMetaDataPortsTest, DifferentLengthsLeaveTheClocksAlone) {
    metaData.takeLocalClock(defaultDataSet("01 00 0001 80 F8 FE FFFF 81 AABBCCFFFEDDEEFF 18 00"));
    takeLists(2, 2, 1);
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("localClockId":"AA:BB:CC:FF:FE:DD:EE:FF")"));
}

TEST_F(PtpMetaDataPortsTest, EmptyListsLeaveNoPortsAndNoError) {
    takeLists(0, 0, 0);
    EXPECT_EQ(status.code, 0);
    EXPECT_THAT(metaData.toJson(), EndsWith(endWithoutPorts));
}

TEST_F(PtpMetaDataPortsTest, NewPortsReplaceTheFormerOnes) {
    takeLists(2, 2, 2);
    EXPECT_EQ(status.code, 0);
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("Port1":{)"));
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("Port2":{)"));
    EXPECT_THAT(metaData.toJson(), Not(HasSubstr(R"("Port7":{)")));
}

TEST_F(PtpMetaDataPortsTest, StatusWithAnErrorKeepsThePorts) {
    status.code = -1;
    const tPtp4lMetaData before = metaData;
    takeLists(2, 2, 2);
    EXPECT_EQ(metaData, before);
    takeLists(2, 2, 1);
    EXPECT_EQ(metaData, before);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), "");
}

TEST_F(PtpMetaDataPortsTest, StatusWithAWarningHindersNothing) {
    status.code = 5;
    takeLists(2, 2, 2);
    EXPECT_EQ(status.code, 5);
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("Port2":{)"));
    takeLists(2, 2, 1);
    EXPECT_EQ(status.code, -52024);
    EXPECT_EQ(metaData, tPtp4lMetaData());
}

TEST_F(PtpMetaDataPortsTest, LaterOfTwoAnswersWithTheSamePortNumberStays) {
    PtpSituation situation;
    addPort(situation, 1, "first");
    addPort(situation, 2, "other");
    addPort(situation, 1, "later");
    situation.portDataSets[0].portState = 6;
    situation.portDataSetsNp[0].asCapable = 1;
    situation.portDataSetsNp[0].neighborPropDelayThresh = 800;
    situation.portDataSets[2].portState = 9;
    situation.portDataSets[2].logSyncInterval = -4;
    PtpSituation expected;
    addPort(expected, 1, "later");
    addPort(expected, 2, "other");
    expected.portDataSets[0].portState = 9;
    expected.portDataSets[0].logSyncInterval = -4;
    EXPECT_EQ(metaDataOf(situation), metaDataOf(expected));
}

TEST_F(PtpMetaDataPortsTest, LaterOfTwoAnswersInARowStays) {
    PtpSituation situation;
    addPort(situation, 1, "first");
    addPort(situation, 1, "later");
    addPort(situation, 2, "other");
    PtpSituation expected;
    addPort(expected, 1, "later");
    addPort(expected, 2, "other");
    EXPECT_EQ(metaDataOf(situation), metaDataOf(expected));
}

TEST_F(PtpMetaDataPortsTest, StateOfThePortPropertiesIsNotUsed) {
    PtpSituation situation;
    addPort(situation, 1);
    situation.portDataSets[0].portState = 9;
    situation.portProperties[0].portState = 2;
    situation.portProperties[0].portIdentity = portIdentity(5);
    const std::string json = metaDataOf(situation).toJson();
    EXPECT_THAT(json, HasSubstr(R"("Port1":{"portState":"PTP_SLAVE",)"));
    EXPECT_THAT(json, Not(HasSubstr("Port5")));
}

TEST_F(PtpMetaDataPortsTest, ClockOfAPortIsNotPartOfItsName) {
    PtpSituation situation;
    addPort(situation, 3);
    situation.portDataSets[0].portIdentity = {zekelVantel::tPtpClockIdentity(0xFFFFFFFFFFFFFFFF),
                                              3};
    EXPECT_THAT(metaDataOf(situation).toJson(), HasSubstr(R"(,"Port3":{)"));
}

TEST_F(PtpMetaDataPortsTest, AnythingButZeroIsCapable) {
    for (const std::int32_t asCapable : {1, 2, -1, INT32_MIN, INT32_MAX}) {
        PtpSituation situation;
        addPort(situation, 1);
        situation.portDataSetsNp[0].asCapable = asCapable;
        EXPECT_THAT(metaDataOf(situation).toJson(), HasSubstr(R"("asCapable":true,)"));
    }
    PtpSituation situation;
    addPort(situation, 1);
    EXPECT_THAT(metaDataOf(situation).toJson(), HasSubstr(R"("asCapable":false,)"));
}

} // namespace
