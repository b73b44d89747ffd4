/// @file
#pragma once

#include <cstddef>

namespace zekelVantel {

/// The parameters that the plug-in accepts, as the JSON text that the host validates its settings
/// with. Ranges and defaults are the host's to apply: reading a configuration uses neither.
extern const char parameterSchema[];

/// Octets of the text, its terminating zero included.
extern const std::size_t parameterSchemaSize;

} // namespace zekelVantel
