/// @file
/// Checks of privileges and limits.
#pragma once

#include <cstdint>
#include <string>

#include "Checks/Finding.h"
#include "Checks/Subject.h"

namespace vantelhost {

/// ptp4l, started by this user, has the capabilities that it needs.
Finding checkCapabilities(const Subject& subject);

/// A socket holds the answers of all ports.
Finding checkDatagramQueue(const Subject& subject);

/// The capabilities that a file gives to the one who executes it, as a set of bits.
/// @param attribute the file's "security.capability"; empty when it has none.
std::uint64_t capabilitiesOf(const std::string& attribute);

} // namespace vantelhost
