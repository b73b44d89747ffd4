#include "Checks/MachineChecks.h"

#include "Checks/CheckTest.h"

using namespace vantelhost;
using namespace std::string_literals;

namespace {

class MachineChecksTest : public CheckTest {
protected:
    MachineChecksTest() {
        for (const char* name : {"/self", "/sys", "/sys/net", "/sys/net/unix"}) {
            ::mkdir((subject.proc + name).c_str(), 0755);
        }
    }

    void setProcess(const std::string& user, const std::string& effective,
                    const std::string& ambient) const {
        writeFile(subject.proc + "/self/status",
                  "Name:\tvantel-host\nUid:\t" + user + "\t" + user + "\t" + user + "\t" + user +
                      "\nCapInh:\t0000000000000000\nCapPrm:\t" + effective + "\nCapEff:\t" +
                      effective + "\nCapBnd:\t000001ffffffffff\nCapAmb:\t" + ambient + "\n");
    }

    void setQueue(const std::string& length) const {
        writeFile(subject.proc + "/sys/net/unix/max_dgram_qlen", length + "\n");
    }
};

const std::string all = "000001ffffffffff";
const std::string none = "0000000000000000";

} // namespace

TEST_F(MachineChecksTest, RootHasAllCapabilities) {
    setProcess("0", all, none);
    EXPECT_THAT(checkCapabilities(subject), isGood());
}

TEST_F(MachineChecksTest, CapabilitiesThatRootLacksAreNamed) {
    setProcess("0", "00000000a80425fb", none); // a container without CAP_NET_ADMIN
    EXPECT_THAT(checkCapabilities(subject),
                says(Verdict::fail, "ptp4l would lack CAP_NET_ADMIN (time stamps in hardware)",
                     "cap_net_admin"));
}

TEST_F(MachineChecksTest, AnotherUserHandsDownAmbientCapabilitiesOnly) {
    setProcess("1000", all, none);
    EXPECT_THAT(checkCapabilities(subject), says(Verdict::fail, "CAP_NET_ADMIN"));
    setProcess("1000", all, "0000000000001400"); // NET_BIND_SERVICE, NET_ADMIN
    EXPECT_THAT(checkCapabilities(subject), isGood());
}

TEST_F(MachineChecksTest, TheTransportSaysWhichAreNeeded) {
    setProcess("0", "0000000000001000", none); // NET_ADMIN
    EXPECT_THAT(checkCapabilities(subject), says(Verdict::fail, "lack CAP_NET_BIND_SERVICE"));
    set("networkTransport", "L2");
    EXPECT_THAT(checkCapabilities(subject), says(Verdict::fail, "lack CAP_NET_RAW"));
    set("networkTransport", "UDPv4RAW");
    EXPECT_THAT(checkCapabilities(subject),
                says(Verdict::fail, "lack CAP_NET_BIND_SERVICE (ports 319 and 320), CAP_NET_RAW"));
    setProcess("0", "0000000000003000", none); // NET_ADMIN, NET_RAW
    set("networkTransport", "L2");
    EXPECT_THAT(checkCapabilities(subject), isGood());
}

TEST_F(MachineChecksTest, TimeStampsInSoftwareNeedNoAdministrator) {
    setProcess("0", "0000000000000400", none); // NET_BIND_SERVICE
    EXPECT_THAT(checkCapabilities(subject), says(Verdict::fail, "lack CAP_NET_ADMIN"));
    subject.software = true;
    EXPECT_THAT(checkCapabilities(subject), isGood());
}

TEST_F(MachineChecksTest, WithoutProcNothingIsKnown) {
    EXPECT_EQ(checkCapabilities(subject).verdict, Verdict::skip);
    EXPECT_EQ(checkDatagramQueue(subject).verdict, Verdict::skip);
}

TEST(CapabilitiesOf, ReadsTheAttributeOfAFile) {
    // cap_net_bind_service,cap_net_admin,cap_net_raw+ep
    EXPECT_EQ(capabilitiesOf("\x01\0\0\x02\0\x34\0\0\0\0\0\0\0\0\0\0\0\0\0\0"s), 0x3400U);
    EXPECT_EQ(capabilitiesOf("\x01\0\0\x02\0\0\0\0\0\0\0\0\x80\0\0\0\0\0\0\0"s), 0x8000000000U);
    // the same, permitted only
    EXPECT_EQ(capabilitiesOf("\0\0\0\x02\0\x34\0\0\0\0\0\0\0\0\0\0\0\0\0\0"s), 0U);
    EXPECT_EQ(capabilitiesOf(""), 0U);
    EXPECT_EQ(capabilitiesOf("\x01\0\0\x02"s), 0U);
}

TEST_F(MachineChecksTest, AQueueOfPortsLessOneIsGood) {
    subject.interfaces.assign(12, "x");
    setQueue("11");
    EXPECT_THAT(checkDatagramQueue(subject), says(Verdict::ok, "is 11"));
}

TEST_F(MachineChecksTest, AShorterQueueIsAWarning) {
    subject.interfaces.assign(12, "x");
    setQueue("10");
    EXPECT_THAT(checkDatagramQueue(subject),
                says(Verdict::warn, "net.unix.max_dgram_qlen is 10, less than 12 ports need",
                     "sysctl -w net.unix.max_dgram_qlen=11"));
}

TEST_F(MachineChecksTest, AQueueWithoutALengthIsNotJudged) {
    setQueue("many");
    EXPECT_EQ(checkDatagramQueue(subject).verdict, Verdict::skip);
}
