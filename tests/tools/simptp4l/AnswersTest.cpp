#include "Client.h"
#include "Daemon.h"

#include <memory>

#include <gtest/gtest.h>

#include "support/Processes.h"

namespace {

/// With two ports, and everything that varies pinned.
const std::string pinned = "clock fixed 1700000000123456789\n"
                           "offset -1500\n"
                           "syncs-before-delay 0\n"
                           "sync-interval 3600\n"
                           "gm-identity 001B21FFFE0A0B0C\n"
                           "clock-identity 0011223344556677\n";

class Simptp4l : public testing::Test {
protected:
    void start(const std::string& script = {}, const std::string& config = {}) {
        daemon = std::make_unique<Daemon>(pinned + script, std::vector<std::string>{"v0", "v1x"},
                                          config);
        ASSERT_TRUE(daemon->waitUntilBound());
        client = std::make_unique<Client>(daemon->folder.path("me"), daemon->socketPath());
    }

    std::unique_ptr<Daemon> daemon;
    std::unique_ptr<Client> client;
};

/// Two octets after octet `at` of a datagram in hexadecimal text.
std::string shortAt(const std::string& hex, std::size_t at) {
    return hex.substr(2 * at, 4);
}

TEST_F(Simptp4l, AnswersTimeStatusOctetForOctet) {
    start();
    EXPECT_EQ(client->ask(requests::timeStatus("abcd")),
              "0d020068000000000000000000000000000000000011223344556677"
              "0000abcd047f"
              "0000000000000000000100000200"
              "00010034c000"
              "fffffffffffffa24"
              "17979cfe3d85cd15"
              "0000000000000000"
              "0000"
              "000000000000000000000000"
              "00000001"
              "001b21fffe0a0b0c");
}

TEST_F(Simptp4l, AnswersParentDataSetOctetForOctet) {
    start();
    EXPECT_EQ(client->ask(requests::parentDataSet()),
              "0d020056000000000000000000000000000000000011223344556677"
              "00000000047f0000000000000000000100000200"
              "000100222002"
              "001b21fffe0a0b0c00010000ffff7fffffff8006214e5d80001b21fffe0a0b0c");
}

TEST_F(Simptp4l, IsItsOwnParentWithoutAGrandmaster) {
    start("gm absent\n", "priority1 77\npriority2 88\n");
    EXPECT_EQ(client->ask(requests::parentDataSet()),
              "0d020056000000000000000000000000000000000011223344556677"
              "00000000047f0000000000000000000100000200"
              "000100222002"
              "001122334455667700000000ffff7fffffff4df8feffff580011223344556677");
}

TEST_F(Simptp4l, AnswersDefaultDataSetFromTheConfiguration) {
    start({}, "priority1               77\npriority2 88\nclockClass 187\nclockAccuracy 0x22\n"
              "offsetScaledLogVariance 17258\ndomainNumber 0\nsummary_interval -3\n");
    EXPECT_EQ(client->ask(requests::defaultDataSet()),
              "0d02004a000000000000000000000000000000000011223344556677"
              "00000000047f0000000000000000000100000200"
              "000100162000"
              "010000024dbb22436a5800112233445566770000");
}

TEST_F(Simptp4l, AnswersPortDataSetOncePerPortInPortOrder) {
    start({}, "logSyncInterval -3\nlogAnnounceInterval 0\ndelay_mechanism P2P\n");
    ASSERT_TRUE(client->send(requests::portDataSet()));
    EXPECT_EQ(client->receive(), "0d020050000000000000000000000000000000000011223344556677"
                                 "00010000047f0000000000000000000100000200"
                                 "0001001c2004"
                                 "0011223344556677000108000000000000000000"
                                 "0003fd020002");
    EXPECT_EQ(client->receive(), "0d020050000000000000000000000000000000000011223344556677"
                                 "00020000047f0000000000000000000100000200"
                                 "0001001c2004"
                                 "0011223344556677000206000000000000000000"
                                 "0003fd020002");
    EXPECT_TRUE(client->isQuiet());
}

TEST_F(Simptp4l, AnswersPortDataSetNpOncePerPort) {
    start({}, "neighborPropDelayThresh 800\n");
    ASSERT_TRUE(client->send(requests::portDataSetNp()));
    for (const char* port : {"0001", "0002"}) {
        EXPECT_EQ(client->receive(), "0d02003e000000000000000000000000000000000011223344556677" +
                                         std::string(port) +
                                         "0000047f0000000000000000000100000200"
                                         "0001000ac002"
                                         "0000032000000001");
    }
}

TEST_F(Simptp4l, PadsPortPropertiesToAnEvenLength) {
    start();
    ASSERT_TRUE(client->send(requests::portProperties()));
    EXPECT_EQ(client->receive(), "0d020046000000000000000000000000000000000011223344556677"
                                 "00010000047f0000000000000000000100000200"
                                 "00010012c004"
                                 "0011223344556677000108010276"
                                 "3000");
    EXPECT_EQ(client->receive(), "0d020046000000000000000000000000000000000011223344556677"
                                 "00020000047f0000000000000000000100000200"
                                 "00010012c004"
                                 "001122334455667700020601037631"
                                 "78");
}

TEST_F(Simptp4l, StrictPaddingDropsAMessageLengthThatLeavesOutThePadding) {
    start("padding strict\n");
    ASSERT_TRUE(client->send(requests::portProperties("0043")));
    ASSERT_TRUE(client->send(requests::portProperties("0044")));
    EXPECT_EQ(client->receive(2).size(), 2U);
    EXPECT_EQ(client->ask(requests::timeStatus()).substr(0, 8), "0d020068");
    EXPECT_NE(daemon->log().find("TLV beyond the message"), std::string::npos);
}

TEST_F(Simptp4l, StrictFollowUpInfoDropsWhatIsNotOfIeee8021As) {
    start("follow-up-info strict\n", "follow_up_info 1\n");
    ASSERT_TRUE(client->send(requests::timeStatus()));
    EXPECT_TRUE(
        waitUntil([&] { return daemon->log().find("not of IEEE 802.1AS") != std::string::npos; }));
    EXPECT_TRUE(client->isQuiet());
    start("follow-up-info strict\n", "follow_up_info 1\ntransportSpecific 0x1\n");
    EXPECT_EQ(client->ask("1d" + requests::timeStatus().substr(2)).substr(0, 8), "1d020068");
}

TEST_F(Simptp4l, StrictFollowUpInfoIsOfNoConcernWithoutFollowUpInfo) {
    start("follow-up-info strict\n", "follow_up_info 0\n");
    EXPECT_EQ(client->ask(requests::timeStatus()).substr(0, 8), "0d020068");
}

TEST_F(Simptp4l, LenientFollowUpInfoAnswersAsBefore44) {
    start("follow-up-info lenient\n", "follow_up_info 1\n");
    EXPECT_EQ(client->ask(requests::timeStatus()).substr(0, 8), "0d020068");
}

TEST_F(Simptp4l, PortThatIsToBeASlaveIsOne) {
    start("port-state 1 9\n");
    EXPECT_EQ(client->ask(requests::portDataSet()).substr(2 * 64, 2), "09");
}

TEST_F(Simptp4l, AnswersAnUnknownIdWithNoSuchId) {
    start();
    EXPECT_EQ(client->ask(requests::head("0036") + "00010002dead"),
              "0d02003c000000000000000000000000000000000011223344556677"
              "00010000047f0000000000000000000100000200"
              "000200080002dead00000000");
}

TEST_F(Simptp4l, AnswersOnlyThePortThatIsAsked) {
    start();
    const std::string answer = client->ask(requests::portDataSet("ffffffffffffffff0002"));
    EXPECT_EQ(shortAt(answer, 28), "0002");
    EXPECT_TRUE(client->isQuiet());
}

TEST_F(Simptp4l, AnswersAPortThatDoesNotExistWithWrongValue) {
    start();
    EXPECT_EQ(client->ask(requests::portDataSet("ffffffffffffffff0009")),
              "0d02003c000000000000000000000000000000000011223344556677"
              "00000000047f0000000000000000000100000200"
              "000200080004200400000000");
}

TEST_F(Simptp4l, IgnoresWhatIsNotARequestForThisClock) {
    start();
    ASSERT_TRUE(client->send("0d"));
    ASSERT_TRUE(client->send("1d" + requests::timeStatus().substr(2)));
    ASSERT_TRUE(client->send("0b" + requests::timeStatus().substr(2)));
    ASSERT_TRUE(
        client->send(requests::head("0036", "0000", "0101010101010101ffff") + "00010002c000"));
    ASSERT_TRUE(client->send(requests::head("0037") + "000100032000ff"));
    EXPECT_EQ(shortAt(client->ask(requests::timeStatus("0077")), 30), "0077");
    EXPECT_TRUE(client->isQuiet());
}

TEST_F(Simptp4l, CarriesTheConfiguredTransportSpecificAndDomain) {
    start({}, "transportSpecific 0x1\ndomainNumber 5\n");
    std::string request = requests::timeStatus();
    request.replace(0, 2, "1d");
    request.replace(8, 2, "05");
    EXPECT_EQ(client->ask(request).substr(0, 10), "1d02006805");
}

TEST_F(Simptp4l, ForcesFieldsAsTold) {
    start("set TIME_STATUS_NP.gmPresent 2\nset PORT_DATA_SET.portState 11 port 2\n"
          "set DEFAULT_DATA_SET.numberPorts 0\nset HEADER.sequenceId 0xBEEF port 0\n"
          "interface-name 2 eth7\nport-state 1 8\n");
    const std::string status = client->ask(requests::timeStatus());
    EXPECT_EQ(status.substr(2 * 92, 8), "00000002");
    EXPECT_EQ(shortAt(status, 30), "beef");
    EXPECT_EQ(shortAt(client->ask(requests::defaultDataSet()), 56), "0000");
    ASSERT_TRUE(client->send(requests::portDataSet()));
    EXPECT_EQ(client->receive().substr(2 * 64, 2), "08");
    EXPECT_EQ(client->receive().substr(2 * 64, 2), "0b");
    ASSERT_TRUE(client->send(requests::portProperties()));
    client->receive();
    EXPECT_EQ(client->receive().substr(2 * 66), "04"
                                                "65746837"
                                                "00");
}

} // namespace
