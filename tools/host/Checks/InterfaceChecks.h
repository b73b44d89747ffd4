/// @file
/// Checks of the network interfaces.
#pragma once

#include <string>

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// It is there, and up.
Finding checkInterface(const Subject& subject, const std::string& interface);

/// It has time stamps in hardware, as the plug-in's configuration asks of ptp4l; a warning when
/// those in software may do.
Finding checkTimeStamping(const Subject& subject, const std::string& interface);

/// Its clock's device may be read, as by "run" with the option --clock auto; else a warning.
Finding checkClockDevice(const Subject& subject, const std::string& interface);

/// All interfaces have one clock.
Finding checkOneClock(const Subject& subject);

} // namespace vantelhost
