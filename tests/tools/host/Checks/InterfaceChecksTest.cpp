#include "Checks/InterfaceChecks.h"

#include <cerrno>

#include <linux/net_tstamp.h>

#include "Checks/CheckTest.h"
#include "Checks/OrdinaryUser.h"

using namespace vantelhost;

namespace {

/// An interface with everything: its name ends in the number of its clock.
TimeStamping complete(const std::string& interface) {
    return {0,
            SOF_TIMESTAMPING_TX_HARDWARE | SOF_TIMESTAMPING_RX_HARDWARE |
                SOF_TIMESTAMPING_RAW_HARDWARE,
            interface.back() - '0', 1U << HWTSTAMP_TX_ON, 1U << HWTSTAMP_FILTER_PTP_V2_EVENT};
}

TimeStamping software(const std::string&) {
    return {0,
            SOF_TIMESTAMPING_TX_SOFTWARE | SOF_TIMESTAMPING_RX_SOFTWARE | SOF_TIMESTAMPING_SOFTWARE,
            -1, 1U << HWTSTAMP_TX_OFF, 1U << HWTSTAMP_FILTER_NONE};
}

TimeStamping receivingOnly(const std::string&) {
    return {0, SOF_TIMESTAMPING_RX_SOFTWARE | SOF_TIMESTAMPING_SOFTWARE, -1, 1U << HWTSTAMP_TX_OFF,
            1U << HWTSTAMP_FILTER_NONE};
}

/// A card that stamps PTP in Ethernet frames alone.
TimeStamping ethernetOnly(const std::string& interface) {
    TimeStamping result = complete(interface);
    result.receiving = 1U << HWTSTAMP_FILTER_NONE | 1U << HWTSTAMP_FILTER_PTP_V2_L2_EVENT;
    return result;
}

TimeStamping absent(const std::string&) {
    TimeStamping result;
    result.error = ENODEV;
    return result;
}

TimeStamping unsupported(const std::string&) {
    TimeStamping result;
    result.error = EOPNOTSUPP;
    return result;
}

} // namespace

TEST_F(CheckTest, AnInterfaceThatIsUpIsGood) {
    EXPECT_THAT(checkInterface(subject, "lo"), says(Verdict::ok, "up"));
}

TEST_F(CheckTest, AnInterfaceThatIsNotThereFails) {
    EXPECT_THAT(checkInterface(subject, "none0"),
                says(Verdict::fail, "No such device", "\"ip link\""));
    EXPECT_EQ(checkInterface(subject, "lo and much more than fits").verdict, Verdict::fail);
}

TEST_F(CheckTest, TimeStampsInHardwareAreGood) {
    subject.timeStamping = complete;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"), says(Verdict::ok, "in hardware"));
}

TEST_F(CheckTest, WhatIsMissingForTimeStampsInHardwareIsNamed) {
    subject.timeStamping = software;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"),
                says(Verdict::fail,
                     "missing: hardware-transmit, hardware-receive, hardware-raw-clock, transmit "
                     "mode on, receive filter for PTPv2 events over UDPv4, PTP hardware clock",
                     "use an interface with a PTP hardware clock (\"ethtool -T eth0\" shows it), "
                     "or let " +
                         subject.daemon + " be a script that calls ptp4l with -S"));
}

TEST_F(CheckTest, WithAScriptForADaemonMissingHardwareIsAWarning) {
    subject.timeStamping = software;
    writeFile(subject.daemon, "#!/bin/sh\nexec /usr/sbin/ptp4l -S \"$@\"\n");
    ::chmod(subject.daemon.c_str(), 0755);
    EXPECT_THAT(checkTimeStamping(subject, "eth0"),
                says(Verdict::warn,
                     "in software, if ptp4l is called with -S; in hardware, missing: "
                     "hardware-transmit, ",
                     "use an interface with a PTP hardware clock (\"ethtool -T eth0\" shows it), "
                     "or let " +
                         subject.daemon + " be a script that calls ptp4l with -S"));
}

TEST_F(CheckTest, WhereSoftwareIsAskedForMissingHardwareIsAWarning) {
    subject.timeStamping = software;
    subject.software = true;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"),
                says(Verdict::warn, "in software, if ptp4l is called with -S"));
    subject.timeStamping = unsupported;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"), says(Verdict::warn, "Operation not supported"));
    subject.timeStamping = complete;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"), says(Verdict::ok, "in hardware"));
}

TEST_F(CheckTest, AnInterfaceWithoutTimeStampsInSoftwareEitherFails) {
    subject.timeStamping = receivingOnly;
    subject.software = true;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"),
                says(Verdict::fail, "; in software: software-transmit", "another interface"));
}

TEST_F(CheckTest, AReceiveFilterForEthernetAloneFailsForUdp) {
    subject.timeStamping = ethernetOnly;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"),
                says(Verdict::fail, "missing: receive filter for PTPv2 events over UDPv4"));
    set("networkTransport", "L2");
    EXPECT_THAT(checkTimeStamping(subject, "eth0"), isGood());
}

TEST_F(CheckTest, TimeStampsOfAMissingInterfaceAreNotChecked) {
    subject.timeStamping = absent;
    EXPECT_EQ(checkTimeStamping(subject, "eth0").verdict, Verdict::skip);
    EXPECT_EQ(checkClockDevice(subject, "eth0").verdict, Verdict::skip);
}

TEST_F(CheckTest, AnInterfaceThatDoesNotTellFails) {
    subject.timeStamping = unsupported;
    EXPECT_THAT(checkTimeStamping(subject, "eth0"), says(Verdict::fail, "Operation not supported"));
}

TEST_F(CheckTest, TheLoopbackHasNoTimeStampsInHardware) {
    EXPECT_EQ(checkTimeStamping(subject, "lo").verdict, Verdict::fail);
}

TEST(MissingForHardware, TheReceiveFilterIsOfTheTransport) {
    const auto missing = [](unsigned filter, const char* transport) {
        auto timeStamping = complete("eth0");
        timeStamping.receiving = 1U << filter;
        return missingForHardware(timeStamping, transport);
    };
    for (const char* transport : {"UDPv4", "UDPv6", "L2", "udpv4", "UDPv4RAW", ""}) {
        EXPECT_EQ(missing(HWTSTAMP_FILTER_ALL, transport), "") << transport;
        EXPECT_EQ(missing(HWTSTAMP_FILTER_PTP_V2_EVENT, transport), "") << transport;
        EXPECT_NE(missing(HWTSTAMP_FILTER_PTP_V1_L4_EVENT, transport), "") << transport;
    }
    for (const char* transport : {"UDPv4", "UDPv6", "udpv4"}) {
        EXPECT_EQ(missing(HWTSTAMP_FILTER_PTP_V2_L4_EVENT, transport), "") << transport;
        EXPECT_EQ(missing(HWTSTAMP_FILTER_PTP_V2_L2_EVENT, transport),
                  "receive filter for PTPv2 events over " + std::string(transport));
    }
    EXPECT_EQ(missing(HWTSTAMP_FILTER_PTP_V2_L2_EVENT, "L2"), "");
    EXPECT_EQ(missing(HWTSTAMP_FILTER_PTP_V2_L4_EVENT, "L2"),
              "receive filter for PTPv2 events over L2");
    for (const unsigned either :
         {HWTSTAMP_FILTER_PTP_V2_L4_EVENT, HWTSTAMP_FILTER_PTP_V2_L2_EVENT}) {
        EXPECT_EQ(missing(either, "UDPv4RAW"), "");
        EXPECT_EQ(missing(either, ""), "");
    }
    EXPECT_EQ(missing(HWTSTAMP_FILTER_NONE, ""), "receive filter for PTPv2 events");
}

TEST_F(CheckTest, AClockDeviceThatMayBeReadIsGood) {
    subject.timeStamping = complete;
    writeFile(subject.dev + "/ptp3", "");
    ::chmod((subject.dev + "/ptp3").c_str(), 0444);
    EXPECT_THAT(checkClockDevice(subject, "eth3"), says(Verdict::ok, "/ptp3"));
}

TEST_F(CheckTest, AClockDeviceThatIsNotThereIsAWarning) {
    subject.timeStamping = complete;
    EXPECT_THAT(checkClockDevice(subject, "eth3"),
                says(Verdict::warn,
                     "/ptp3: No such file or directory; ptp4l does not open it here, but the host "
                     "reads the time of its pairs there",
                     "let udev make it"));
}

TEST_F(CheckTest, AClockDeviceThatMayNotBeReadIsAWarning) {
    subject.timeStamping = complete;
    writeFile(subject.dev + "/ptp3", "");
    ::chmod((subject.dev + "/ptp3").c_str(), 0000);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    EXPECT_THAT(checkClockDevice(subject, "eth3"),
                says(Verdict::warn, "Permission denied; ", "the right to read it"));
}

TEST_F(CheckTest, InterfacesOfOneClockAreGood) {
    subject.timeStamping = complete;
    subject.interfaces = {"a1", "b1"};
    EXPECT_THAT(checkOneClock(subject), says(Verdict::ok, "ptp1"));
}

TEST_F(CheckTest, InterfacesOfDifferentClocksFail) {
    subject.timeStamping = complete;
    subject.interfaces = {"a1", "b2", "c1"};
    EXPECT_THAT(checkOneClock(subject),
                says(Verdict::fail, ": ptp1 of a1 c1, ptp2 of b2",
                     "use a1 c1; \"ethtool -T\" shows an interface's clock"));
    subject.interfaces = {"a1", "b2", "c1", "d2"};
    EXPECT_THAT(checkOneClock(subject), says(Verdict::fail, "", "use a1 c1 or b2 d2; "));
    subject.software = true;
    EXPECT_THAT(checkOneClock(subject), says(Verdict::warn, ": ptp1 of a1 c1, ptp2 of b2 d2"));
}

TEST_F(CheckTest, WhereNoneShareAClockOneInterfaceIsLeft) {
    subject.timeStamping = complete;
    subject.interfaces = {"a1", "b2"};
    EXPECT_THAT(checkOneClock(subject),
                says(Verdict::fail, ": ptp1 of a1, ptp2 of b2",
                     "use one of them, or others that share a clock; \"ethtool -T\""));
}

TEST_F(CheckTest, WithoutClocksThereIsNothingToCompare) {
    subject.timeStamping = software;
    subject.interfaces = {"a1", "b2"};
    EXPECT_EQ(checkOneClock(subject).verdict, Verdict::skip);
}
