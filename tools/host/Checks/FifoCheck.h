/// @file
#pragma once

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// The FIFO of epoch offsets is there, readable, writable where offsets will be written, and nobody
/// else's. Whether somebody writes to it is not to be seen.
Finding checkFifo(const Subject& subject);

} // namespace vantelhost
