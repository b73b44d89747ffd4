#include "tGetDataFromPtp4l.h"

#include <filesystem>

#include <gmock/gmock.h>
#include <sys/stat.h>

#include "support/Descriptors.h"
#include "support/FetcherTest.h"
#include "support/Octets.h"

using testing::EndsWith;
using testing::HasSubstr;
using zekelVantel::tGetDataFromPtp4l;

namespace {

class PtpFetchTest : public FetcherTest {};

constexpr char jsonOfTheClocks[] =
    R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C",)"
    R"("gmMacAddress":"00:1B:21:0A:0B:0C",)"
    R"("localClockId":"AA:BB:CC:FF:FE:DD:EE:FF",)"
    R"("clockClass":248,"clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":65535,)"
    R"("priority1":128,"priority2":129,"domainNumber":24,)"
    R"("gmClockClass":6,"gmClockAccuracy":"WITHIN_100NS",)"
    R"("gmOffsetLogVariance":20061,"gmPriority1":128,"gmPriority2":127)";

constexpr char jsonOfPort1[] = R"(,"Port1":{"portState":"PTP_SLAVE","asCapable":true,)"
                               R"("logSyncInterval":-3,"logAnnounceInterval":1,)"
                               R"("logPdelayInterval":-2,)"
                               R"("interface":"swp1","neighborPropDelayThreshold":800})";

constexpr char jsonOfPorts2And3[] = R"(,"Port2":{"portState":"PTP_MASTER","asCapable":false,)"
                                    R"("logSyncInterval":-3,"logAnnounceInterval":1,)"
                                    R"("logPdelayInterval":-2,)"
                                    R"("interface":"swp2","neighborPropDelayThreshold":801})"
                                    R"(,"Port3":{"portState":"PTP_MASTER","asCapable":false,)"
                                    R"("logSyncInterval":-3,"logAnnounceInterval":1,)"
                                    R"("logPdelayInterval":-2,)"
                                    R"("interface":"swp3","neighborPropDelayThreshold":802})";

ino_t inodeOf(const std::string& path) {
    struct stat attributes {};
    EXPECT_EQ(stat(path.c_str(), &attributes), 0);
    return attributes.st_ino;
}

TEST_F(PtpFetchTest, ConstructionTouchesNothing) {
    writeFile(localPath, "a file");
    const int before = openDescriptors();
    { const tGetDataFromPtp4l another("./ptp4l_bc", 1); }
    const tGetDataFromPtp4l third("./missing", 1);
    EXPECT_EQ(openDescriptors(), before);
    EXPECT_EQ(readFile(localPath), "a file");
    EXPECT_TRUE(daemon.requests().empty());
}

TEST_F(PtpFetchTest, TimeStatusIsCopiedFieldForField) {
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(timeStatus.masterOffset, -42);
    EXPECT_EQ(timeStatus.ingressTime, 0x1797AB0123456789);
    EXPECT_EQ(timeStatus.cumulativeScaledRateOffset, -7);
    EXPECT_EQ(timeStatus.scaledLastGmPhaseChange, 5);
    EXPECT_EQ(timeStatus.gmTimeBaseIndicator, 3);
    EXPECT_EQ(serialized(timeStatus.lastGmPhaseChange), octets("1234 5566778899AABBCC DDEE"));
    EXPECT_EQ(timeStatus.gmPresent, 1);
    EXPECT_EQ(serialized(timeStatus.gmIdentity), octets("001B21FFFE0A0B0C"));
}

TEST_F(PtpFetchTest, MetadataHoldsTheClocksAndThePort) {
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(metaData.toJson(), std::string(jsonOfTheClocks) + jsonOfPort1 + "}");
}

TEST_F(PtpFetchTest, ThreePortsGiveThreeEntries) {
    daemon.setPorts(3);
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(metaData.toJson(),
              std::string(jsonOfTheClocks) + jsonOfPort1 + jsonOfPorts2And3 + "}");
}

TEST_F(PtpFetchTest, TenThousandPortsAreTaken) {
    daemon.setPorts(10000);
    EXPECT_EQ(fetch(), 0);
    const std::string json = metaData.toJson();
    EXPECT_NE(json.find("\"Port10000\":{"), std::string::npos);
    EXPECT_LT(json.size(), 10000U * 200);
}

TEST_F(PtpFetchTest, NoPortsMeanNoReceivesAndNoEntries) {
    daemon.setPorts(0);
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(metaData.toJson(), std::string(jsonOfTheClocks) + "}");
    EXPECT_EQ(timeStatus.masterOffset, -42);
    EXPECT_EQ(fetch(), 0);
    daemon.settle();
    EXPECT_EQ(daemon.requests().size(), 12U);
}

TEST_F(PtpFetchTest, NumberOfPortsIsReadAfreshByEachCall) {
    for (const unsigned ports : {1U, 3U, 0U, 2U}) {
        daemon.settle();
        daemon.setPorts(static_cast<std::uint16_t>(ports));
        ASSERT_EQ(fetch(), 0) << ports;
        const std::string json = metaData.toJson();
        for (const unsigned port : {1U, 2U, 3U}) {
            const bool found = json.find("\"Port" + std::to_string(port)) != std::string::npos;
            EXPECT_EQ(found, port <= ports) << port << " of " << ports;
        }
    }
}

TEST_F(PtpFetchTest, SixRequestsFollowEachOtherInOrder) {
    tGetDataFromPtp4l sender("./ptp4l_bc", 0xF1);
    ASSERT_EQ(sender.fetch(timeStatus, metaData), 0);
    const std::string head = "0000 0000000000000000 00000000 0000000000000000 0001";
    const std::string target = "04 7F FFFFFFFFFFFFFFFF FFFF 00 00 00 00";
    const Octets expected[] = {
        octets("1D02 0068 0000" + head + "0000" + target + "0001 0034 C000") + Octets(50),
        octets("1D02 0056 0000" + head + "0001" + target + "0001 0022 2002") + Octets(32),
        octets("1D02 004A 0000" + head + "0002" + target + "0001 0016 2000") + Octets(20),
        octets("1D02 0050 0000" + head + "0003" + target + "0001 001C 2004") + Octets(10) +
            octets("03") + Octets(15),
        octets("1D02 003E 0000" + head + "0004" + target + "0001 000A C002") + Octets(8),
        octets("1D02 0043 0000" + head + "0005" + target + "0001 0010 C004") + Octets(10) +
            octets("03 00 00 00"),
    };
    const auto requests = daemon.requests();
    ASSERT_EQ(requests.size(), 6U);
    for (std::size_t index = 0; index < 6; ++index) {
        EXPECT_EQ(requests[index].octets, expected[index]) << index;
    }
}

TEST_F(PtpFetchTest, RequestsComeFromThePathOfTheProcess) {
    ASSERT_EQ(fetch(), 0);
    for (const auto& request : daemon.requests()) {
        EXPECT_EQ(request.source, localPath);
    }
}

TEST_F(PtpFetchTest, NextCallGoesOnWithSequenceIdsOnTheSameSocket) {
    ASSERT_EQ(fetch(), 0);
    const ino_t socketFile = inodeOf(localPath);
    const int descriptor = descriptorBoundTo(localPath);
    const int descriptors = openDescriptors();
    ASSERT_NE(descriptor, -1);
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(inodeOf(localPath), socketFile);
    EXPECT_EQ(descriptorBoundTo(localPath), descriptor);
    EXPECT_EQ(openDescriptors(), descriptors);
    const auto requests = daemon.requests();
    ASSERT_EQ(requests.size(), 12U);
    for (std::size_t index = 0; index < 12; ++index) {
        EXPECT_EQ(requests[index].sequenceId(), index);
    }
}

TEST_F(PtpFetchTest, DestructionRemovesTheSocket) {
    {
        tGetDataFromPtp4l another("./ptp4l_bc", 0);
        ASSERT_EQ(another.fetch(timeStatus, metaData), 0);
        EXPECT_TRUE(std::filesystem::is_socket(localPath));
    }
    EXPECT_FALSE(std::filesystem::exists(localPath));
    EXPECT_EQ(descriptorBoundTo(localPath), -1);
}

TEST_F(PtpFetchTest, AnswersAreToldByTheirLengthAlone) {
    daemon.setScript([](const FakePtp4l::Request&, FakePtp4l::Answers& answers) {
        for (auto& answer : answers) {
            answer[0] = 0;      // neither a transport nor a management message
            answer[1] = 0xFF;   // of no version
            answer[2] = 0xFF;   // of another length
            answer[30] = 0xAB;  // to another request
            answer[46] = 0x05;  // no answer
            answer[48] = 0xFF;  // no management TLV
            answer[50] = 0xFF;  // of another length
            answer[52] ^= 0xFF; // for another data set
        }
    });
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(timeStatus.masterOffset, -42);
    EXPECT_EQ(metaData.toJson(), std::string(jsonOfTheClocks) + jsonOfPort1 + "}");
}

TEST_F(PtpFetchTest, AnswersOfPortsMayBeLongerThanExpected) {
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portDataSet ||
            request.managementId() == FakePtp4l::portDataSetNp) {
            answers.at(0).resize(answers.at(0).size() + 1, 0xFF);
        } else if (request.managementId() == FakePtp4l::portPropertiesNp) {
            answers.at(0).resize(1400, 0xFF);
        }
    });
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(metaData.toJson(), std::string(jsonOfTheClocks) + jsonOfPort1 + "}");
}

TEST_F(PtpFetchTest, AnswersOfPortsMayComeInAnyOrderAndTwice) {
    daemon.setPorts(2);
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (answers.size() == 2 && request.managementId() == FakePtp4l::portDataSet) {
            answers.front() = answers.back();
        }
    });
    ASSERT_EQ(fetch(), 0);
    EXPECT_EQ(metaData.toJson().find("Port1"), std::string::npos);
    EXPECT_THAT(metaData.toJson(),
                HasSubstr(R"("interface":"swp2","neighborPropDelayThreshold":801}})"));
}

TEST_F(PtpFetchTest, PadOctetOfAnAnswerIsNeitherNeededNorInTheWay) {
    daemon.setPorts(10);
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portPropertiesNp) {
            EXPECT_EQ(answers[0].size(), 72U) << "a name of 4 octets and a pad";
            EXPECT_EQ(answers[9].size(), 72U) << "a name of 5 octets";
            answers[0].pop_back();
        }
    });
    ASSERT_EQ(fetch(), 0);
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("Port10":{"portState":"PTP_MASTER")"));
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("interface":"swp10",)"));
    EXPECT_THAT(metaData.toJson(), HasSubstr(R"("interface":"swp1",)"));
    EXPECT_THAT(metaData.toJson(), EndsWith("}}"));
}

TEST_F(PtpFetchTest, FetchersOfOneProcessShareThePath) {
    ASSERT_EQ(fetch(), 0);
    {
        tGetDataFromPtp4l another("./ptp4l_bc", 0);
        EXPECT_EQ(another.fetch(timeStatus, metaData), 0);
    }
    daemon.settle();
    EXPECT_EQ(daemon.requests().back().source, localPath);
    EXPECT_EQ(daemon.requests().back().sequenceId(), 5);
}

} // namespace
