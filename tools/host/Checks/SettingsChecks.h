/// @file
/// Checks of settings that ptp4l takes and that yield no time, or a wrong one.
#pragma once

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// No interface is named twice: ptp4l makes one port of both.
Finding checkInterfaces(const Subject& subject);

/// "followUpInfo" goes with a "transportSpecific" of IEEE 802.1AS.
Finding checkFollowUpInfo(const Subject& subject);

/// "delayMechanism" measures a delay.
Finding checkDelayMechanism(const Subject& subject);

} // namespace vantelhost
