/// @file
#pragma once

#include <nlohmann/json.hpp>

namespace vantelhost {

/// Members keep the order in which they were added.
using Json = nlohmann::ordered_json;

} // namespace vantelhost
