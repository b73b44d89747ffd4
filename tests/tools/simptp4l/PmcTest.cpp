#include "Daemon.h"

#include <gtest/gtest.h>
#include <unistd.h>

namespace {

std::string pmcPath() {
    for (const char* path : {"/usr/sbin/pmc", "/usr/bin/pmc"}) {
        if (access(path, X_OK) == 0) {
            return path;
        }
    }
    return {};
}

/// Asks the simulator with the pmc that is installed.
class Simptp4lPmc : public testing::Test {
protected:
    void SetUp() override {
        if (pmcPath().empty()) {
            GTEST_SKIP() << "pmc is not installed (Debian package linuxptp)";
        }
        ASSERT_TRUE(daemon.waitUntilBound());
    }

    std::string get(const std::string& dataSet) const {
        Child pmc({pmcPath(), "-u", "-b", "0", "-i", daemon.folder.path("pmc"), "-s",
                   daemon.socketPath(), "GET " + dataSet});
        EXPECT_EQ(pmc.wait(), 0) << pmc.errors();
        return pmc.output();
    }

    Daemon daemon{
        "clock fixed 1700000000123456789\noffset -1500\nsyncs-before-delay 0\nsync-interval 3600\n"
        "gm-identity 001B21FFFE0A0B0C\nclock-identity 0011223344556677\n",
        {"v0", "v1x"},
        "priority1 77\npriority2 88\nlogSyncInterval -3\n"};
};

TEST_F(Simptp4lPmc, PrintsTimeStatusNp) {
    EXPECT_EQ(get("TIME_STATUS_NP"),
              "sending: GET TIME_STATUS_NP\n"
              "\t001122.3344.556677-0 seq 0 RESPONSE MANAGEMENT TIME_STATUS_NP \n"
              "\t\tmaster_offset              -1500\n"
              "\t\tingress_time               1700000000123456789\n"
              "\t\tcumulativeScaledRateOffset +0.000000000\n"
              "\t\tscaledLastGmPhaseChange    0\n"
              "\t\tgmTimeBaseIndicator        0\n"
              "\t\tlastGmPhaseChange          0x0000'0000000000000000.0000\n"
              "\t\tgmPresent                  true\n"
              "\t\tgmIdentity                 001b21.fffe.0a0b0c\n");
}

TEST_F(Simptp4lPmc, PrintsParentDataSet) {
    EXPECT_EQ(get("PARENT_DATA_SET"),
              "sending: GET PARENT_DATA_SET\n"
              "\t001122.3344.556677-0 seq 0 RESPONSE MANAGEMENT PARENT_DATA_SET \n"
              "\t\tparentPortIdentity                    001b21.fffe.0a0b0c-1\n"
              "\t\tparentStats                           0\n"
              "\t\tobservedParentOffsetScaledLogVariance 0xffff\n"
              "\t\tobservedParentClockPhaseChangeRate    0x7fffffff\n"
              "\t\tgrandmasterPriority1                  128\n"
              "\t\tgm.ClockClass                         6\n"
              "\t\tgm.ClockAccuracy                      0x21\n"
              "\t\tgm.OffsetScaledLogVariance            0x4e5d\n"
              "\t\tgrandmasterPriority2                  128\n"
              "\t\tgrandmasterIdentity                   001b21.fffe.0a0b0c\n");
}

TEST_F(Simptp4lPmc, PrintsDefaultDataSet) {
    EXPECT_EQ(get("DEFAULT_DATA_SET"),
              "sending: GET DEFAULT_DATA_SET\n"
              "\t001122.3344.556677-0 seq 0 RESPONSE MANAGEMENT DEFAULT_DATA_SET \n"
              "\t\ttwoStepFlag             1\n"
              "\t\tslaveOnly               0\n"
              "\t\tnumberPorts             2\n"
              "\t\tpriority1               77\n"
              "\t\tclockClass              248\n"
              "\t\tclockAccuracy           0xfe\n"
              "\t\toffsetScaledLogVariance 0xffff\n"
              "\t\tpriority2               88\n"
              "\t\tclockIdentity           001122.3344.556677\n"
              "\t\tdomainNumber            0\n");
}

std::string portDataSet(const std::string& port, const std::string& state) {
    return "\t001122.3344.556677-" + port +
           " seq 0 RESPONSE MANAGEMENT PORT_DATA_SET \n"
           "\t\tportIdentity            001122.3344.556677-" +
           port + "\n\t\tportState               " + state +
           "\n"
           "\t\tlogMinDelayReqInterval  0\n"
           "\t\tpeerMeanPathDelay       0\n"
           "\t\tlogAnnounceInterval     1\n"
           "\t\tannounceReceiptTimeout  3\n"
           "\t\tlogSyncInterval         -3\n"
           "\t\tdelayMechanism          1\n"
           "\t\tlogMinPdelayReqInterval 0\n"
           "\t\tversionNumber           2\n";
}

TEST_F(Simptp4lPmc, PrintsPortDataSetOfBothPorts) {
    EXPECT_EQ(get("PORT_DATA_SET"), "sending: GET PORT_DATA_SET\n" +
                                        portDataSet("1", "UNCALIBRATED") +
                                        portDataSet("2", "MASTER"));
}

TEST_F(Simptp4lPmc, PrintsPortDataSetNpOfBothPorts) {
    EXPECT_EQ(get("PORT_DATA_SET_NP"),
              "sending: GET PORT_DATA_SET_NP\n"
              "\t001122.3344.556677-1 seq 0 RESPONSE MANAGEMENT PORT_DATA_SET_NP \n"
              "\t\tneighborPropDelayThresh 20000000\n"
              "\t\tasCapable               1\n"
              "\t001122.3344.556677-2 seq 0 RESPONSE MANAGEMENT PORT_DATA_SET_NP \n"
              "\t\tneighborPropDelayThresh 20000000\n"
              "\t\tasCapable               1\n");
}

TEST_F(Simptp4lPmc, PrintsPortPropertiesOfBothPorts) {
    EXPECT_EQ(get("PORT_PROPERTIES_NP"),
              "sending: GET PORT_PROPERTIES_NP\n"
              "\t001122.3344.556677-1 seq 0 RESPONSE MANAGEMENT PORT_PROPERTIES_NP \n"
              "\t\tportIdentity            001122.3344.556677-1\n"
              "\t\tportState               UNCALIBRATED\n"
              "\t\ttimestamping            HARDWARE\n"
              "\t\tinterface               v0\n"
              "\t001122.3344.556677-2 seq 0 RESPONSE MANAGEMENT PORT_PROPERTIES_NP \n"
              "\t\tportIdentity            001122.3344.556677-2\n"
              "\t\tportState               MASTER\n"
              "\t\ttimestamping            HARDWARE\n"
              "\t\tinterface               v1x\n");
}

} // namespace
