/// @file
#pragma once

#include <string>

#include "Schema.h"

namespace vantelhost {

/// The schema for people: one line per parameter under a heading.
std::string schemaTable(const Schema& schema);

} // namespace vantelhost
