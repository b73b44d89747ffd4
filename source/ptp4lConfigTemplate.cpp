#include "ptp4lConfigTemplate.h"

namespace zekelVantel {

// [oddity placeholder-name] $neighborPropDelayThreshold stands beside ptp4l's shorter
// neighborPropDelayThresh: the placeholder carries the protocol's name of the parameter.
//
// [oddity stays-uncalibrated] With free_running 1 ptp4l never locks: the port that follows a
// grandmaster stays UNCALIBRATED.
//
// [oddity follow-up-info] follow_up_info 1 beside transportSpecific 0 is written as asked for:
// ptp4l up to 4.3 answers, and which one will read this is not known.
//
// [oddity read-only-socket] No uds_ro_address, which ptp4l's of one machine then share: those
// before 4.0 refuse a file that has it.
const char ptp4lConfigTemplate[] = R"template([global]
#
# Default Data Set
#
twoStepFlag             1
gmCapable               1
priority1               $priority1
priority2               $priority2
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
offsetScaledLogVariance $offsetScaledLogVariance

free_running            1
freq_est_interval       1

#
# Port Data Set
#
logAnnounceInterval     $logAnnounceInterval
logSyncInterval         $logSyncInterval
logMinPdelayReqInterval 0
announceReceiptTimeout  3
syncReceiptTimeout      $syncReceiptTimeout
delayAsymmetry          0
fault_reset_interval    4
neighborPropDelayThresh $neighborPropDelayThreshold
min_neighbor_prop_delay -20000000

#
# Run time options
#
assume_two_step      $assumeTwoStep
logging_level        5
path_trace_enabled   $pathTraceEnabled
follow_up_info       $followUpInfo
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
transportSpecific $transportSpecific
ptp_dst_mac       $ptpDstMac
p2p_dst_mac       01:80:C2:00:00:0E
uds_address       $udsAddress

#
# Default interface options
#
network_transport    $networkTransport
delay_mechanism      $delayMechanism
time_stamping        hardware
tsproc_mode          filter
delay_filter         moving_median
delay_filter_length  10
egressLatency        156
ingressLatency       208
boundary_clock_jbod  0
)template";

} // namespace zekelVantel
