#include <gtest/gtest.h>

#include "ProtocolConfigFixture.h"

namespace {

constexpr char expectedFile[] = R"([global]
#
# Default Data Set
#
twoStepFlag             1
gmCapable               1
priority1               128
priority2               128
domainNumber            0
clockClass              248
clockAccuracy           0xFE
#
# This needs to be calculated by R&K.
# For IEEE 802.1AS-2011 : The value 17258(0x436A) is the default value to
#                         be used when this value is unknown. This default
#                         value is defined by the Corrigendum 1.
# For IEEE 1588 : The value 65535(0xFFFF) is the value used for uncalculated
#                 device that should be in the lowest priority.
#
offsetScaledLogVariance 65535

free_running            1
freq_est_interval       1

#
# Port Data Set
#
logAnnounceInterval     1
logSyncInterval         0
logMinPdelayReqInterval 0
announceReceiptTimeout  3
syncReceiptTimeout      0
delayAsymmetry          0
fault_reset_interval    4
neighborPropDelayThresh 20000000
min_neighbor_prop_delay -20000000

#
# Run time options
#
assume_two_step      0
logging_level        5
path_trace_enabled   0
follow_up_info       0
hybrid_e2e           0
tx_timestamp_timeout 50
use_syslog           1
verbose              0
summary_interval     -3
kernel_leap          1
check_fup_sync       0

#
# Servo options
#
pi_proportional_const      0.0
pi_integral_const          0.0
pi_proportional_scale      0.0
pi_proportional_exponent   -0.3
pi_proportional_norm_max   0.7
pi_integral_scale          0.0
pi_integral_exponent       0.4
pi_integral_norm_max       0.3
step_threshold             0.00002
first_step_threshold       0.00002
max_frequency              62000
clock_servo                pi
sanity_freq_limit          200000000
ntpshm_segment             0

#
# Transport options
#
transportSpecific 0x0
ptp_dst_mac       01:00:5e:00:01:81
p2p_dst_mac       01:80:C2:00:00:0E
uds_address       /var/run/ptp4l_bc

#
# Default interface options
#
network_transport    UDPv4RAW
delay_mechanism      E2E
time_stamping        hardware
tsproc_mode          filter
delay_filter         moving_median
delay_filter_length  10
egressLatency        156
ingressLatency       208
boundary_clock_jbod  0
)";

using ProtocolConfigWholeFileTest = ProtocolConfigFixture;

TEST_F(ProtocolConfigWholeFileTest, SchemaDefaultsFillTheFifteenPlaceholders) {
    read();
    EXPECT_EQ(written(), expectedFile);
    EXPECT_TRUE(log.lines().empty());
}

} // namespace
