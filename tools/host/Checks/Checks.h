/// @file
#pragma once

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// All checks of the machine, in the order in which one would mend it.
CheckResults checkMachine(const Subject& subject);

} // namespace vantelhost
