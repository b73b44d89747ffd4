/// @file
/// Checks of the files that plug-in and ptp4l make, and of the FIFO.
#pragma once

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// "configFile" can be written.
Finding checkConfigFile(const Subject& subject);

/// "udsAddress" is a path that a socket can have.
Finding checkUdsAddress(const Subject& subject);

/// A socket can be made there.
Finding checkUdsFolder(const Subject& subject);

/// Nobody listens there.
Finding checkUdsInUse(const Subject& subject);

/// The plug-in's own socket can be made.
Finding checkOwnSocket(const Subject& subject);

} // namespace vantelhost
