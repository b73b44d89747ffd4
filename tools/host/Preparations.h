/// @file
/// What a run needs before the plug-in gets its settings.
#pragma once

#include <optional>
#include <string>

#include "Json.h"

namespace vantelhost {

/// Throws UsageError when somebody listens at "udsAddress": ptp4l would take the socket away from
/// another clock, or from the ptp4l that a killed host left behind.
void refuseSocketInUse(const Json& settings);

/// Makes the folder of "configFile", with those above.
/// @return the folder, if it was missing.
/// Throws UsageError when it cannot be made.
std::optional<std::string> makeConfigFolder(const Json& settings);

/// The same for settings that are to follow others, whose ptp4l still listens.
/// @param force as --force
/// @return as makeConfigFolder().
std::optional<std::string> prepareChange(const Json& settings, const Json& before, bool force);

} // namespace vantelhost
