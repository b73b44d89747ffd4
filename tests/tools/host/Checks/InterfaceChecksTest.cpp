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
    return {0, SOF_TIMESTAMPING_TX_SOFTWARE | SOF_TIMESTAMPING_RX_SOFTWARE, -1,
            1U << HWTSTAMP_TX_OFF, 1U << HWTSTAMP_FILTER_NONE};
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
                     "mode on, receive filter for PTPv2 events, PTP hardware clock",
                     "ethtool -T eth0"));
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

TEST(MissingForHardware, OneFilterOfFourIsEnough) {
    for (const unsigned filter :
         {HWTSTAMP_FILTER_ALL, HWTSTAMP_FILTER_PTP_V2_EVENT, HWTSTAMP_FILTER_PTP_V2_L4_EVENT,
          HWTSTAMP_FILTER_PTP_V2_L2_EVENT}) {
        auto timeStamping = complete("eth0");
        timeStamping.receiving = 1U << filter;
        EXPECT_EQ(missingForHardware(timeStamping), "");
    }
    auto timeStamping = complete("eth0");
    timeStamping.receiving = 1U << HWTSTAMP_FILTER_PTP_V1_L4_EVENT;
    EXPECT_EQ(missingForHardware(timeStamping), "receive filter for PTPv2 events");
}

TEST_F(CheckTest, AClockDeviceThatMayBeOpenedIsGood) {
    subject.timeStamping = complete;
    writeFile(subject.dev + "/ptp3", "");
    EXPECT_THAT(checkClockDevice(subject, "eth3"), says(Verdict::ok, "/ptp3"));
}

TEST_F(CheckTest, AClockDeviceThatIsNotThereFails) {
    subject.timeStamping = complete;
    EXPECT_THAT(checkClockDevice(subject, "eth3"),
                says(Verdict::fail, "/ptp3: No such file or directory", "udev"));
}

TEST_F(CheckTest, AClockDeviceThatMayNotBeOpenedFails) {
    subject.timeStamping = complete;
    writeFile(subject.dev + "/ptp3", "");
    ::chmod((subject.dev + "/ptp3").c_str(), 0000);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    EXPECT_THAT(checkClockDevice(subject, "eth3"),
                says(Verdict::fail, "Permission denied", "the right to read and write"));
}

TEST_F(CheckTest, InterfacesOfOneClockAreGood) {
    subject.timeStamping = complete;
    subject.interfaces = {"a1", "b1"};
    EXPECT_THAT(checkOneClock(subject), says(Verdict::ok, "ptp1"));
}

TEST_F(CheckTest, InterfacesOfDifferentClocksFail) {
    subject.timeStamping = complete;
    subject.interfaces = {"a1", "b2", "c1"};
    EXPECT_THAT(checkOneClock(subject), says(Verdict::fail, ": ptp1 of a1 c1, ptp2 of b2"));
}

TEST_F(CheckTest, WithoutClocksThereIsNothingToCompare) {
    subject.timeStamping = software;
    subject.interfaces = {"a1", "b2"};
    EXPECT_EQ(checkOneClock(subject).verdict, Verdict::skip);
}
