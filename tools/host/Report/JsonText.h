/// @file
#pragma once

#include <string>

#include "Json.h"

namespace vantelhost {

/// The value for people: a string bare, anything else as JSON text.
std::string jsonText(const Json& value);

/// The same of an object's member; empty when it is not there.
std::string jsonText(const Json& object, const char* key);

} // namespace vantelhost
