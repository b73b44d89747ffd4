/// @file
#pragma once

#include <string>

#include "CommandLine.h"
#include "Schema.h"

namespace vantelhost {

/// The schema for people: one line per parameter under a heading.
std::string schemaTable(const Schema& schema);

/// Prints the plug-in's schema. Throws UsageError.
/// @return the exit status.
int showSchema(const SchemaOptions& options);

} // namespace vantelhost
