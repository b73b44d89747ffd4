#include <string_view>

#include <gtest/gtest.h>

#include "ProtocolConfigFixture.h"
#include "ptp4lConfigTemplate.h"

namespace {

/// A line that the template leaves open, and as the defaults of the schema fill it.
struct FilledLine {
    std::string_view inTemplate;
    std::string_view inFile;
};

constexpr FilledLine filledLines[] = {
    {"priority1               $priority1", "priority1               128"},
    {"priority2               $priority2", "priority2               128"},
    {"offsetScaledLogVariance $offsetScaledLogVariance", "offsetScaledLogVariance 65535"},
    {"logAnnounceInterval     $logAnnounceInterval", "logAnnounceInterval     1"},
    {"logSyncInterval         $logSyncInterval", "logSyncInterval         0"},
    {"syncReceiptTimeout      $syncReceiptTimeout", "syncReceiptTimeout      0"},
    {"neighborPropDelayThresh $neighborPropDelayThreshold", "neighborPropDelayThresh 20000000"},
    {"assume_two_step      $assumeTwoStep", "assume_two_step      0"},
    {"path_trace_enabled   $pathTraceEnabled", "path_trace_enabled   0"},
    {"follow_up_info       $followUpInfo", "follow_up_info       0"},
    {"transportSpecific $transportSpecific", "transportSpecific 0x0"},
    {"ptp_dst_mac       $ptpDstMac", "ptp_dst_mac       01:00:5e:00:01:81"},
    {"uds_address       $udsAddress", "uds_address       /var/run/ptp4l_bc"},
    {"network_transport    $networkTransport", "network_transport    UDPv4RAW"},
    {"delay_mechanism      $delayMechanism", "delay_mechanism      E2E"},
};

using ProtocolConfigWholeFileTest = ProtocolConfigFixture;

TEST_F(ProtocolConfigWholeFileTest, SchemaDefaultsFillTheFifteenPlaceholders) {
    std::string expected = zekelVantel::ptp4lConfigTemplate;
    for (const FilledLine& line : filledLines) {
        const std::size_t at = expected.find(line.inTemplate);
        ASSERT_NE(at, std::string::npos) << line.inTemplate;
        expected.replace(at, line.inTemplate.size(), line.inFile);
    }
    read();
    EXPECT_EQ(written(), expected);
    EXPECT_TRUE(log.lines().empty());
}

} // namespace
