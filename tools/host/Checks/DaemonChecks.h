/// @file
/// Checks of ptp4l, as it is installed.
#pragma once

#include <chrono>
#include <string>

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// It can be executed.
Finding checkDaemon(const Subject& subject);

/// It takes the file that the plug-in wrote. Run without an interface, ptp4l reads its file and
/// then refuses to start a clock.
Finding checkConfiguration(const Subject& subject);

/// The same, with the time that it gives the daemon.
Finding checkConfigurationWithin(const Subject& subject, std::chrono::milliseconds longest);

/// No other one runs.
Finding checkOtherDaemons(const Subject& subject);

/// Whether it is a script, such as one that calls the real ptp4l with -S.
bool isScript(const std::string& program);

/// What to do when ptp4l refuses one of its options; empty when no setting is concerned.
std::string mendFor(const std::string& option);

} // namespace vantelhost
