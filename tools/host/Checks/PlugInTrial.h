/// @file
#pragma once

#include <optional>
#include <string>

#include "Checks/Finding.h"
#include "Json.h"
#include "PlugIn.h"
#include "Schema.h"
#include "Settings.h"

namespace vantelhost {

/// Lets the plug-in do what comes before the start, and write ptp4l's file into a folder that is
/// removed with this object. Each check but the first asks for the one before to have succeeded.
class PlugInTrial {
public:
    /// Throws std::system_error when there is no folder.
    PlugInTrial(std::string library, UserSettings user);
    ~PlugInTrial();
    PlugInTrial(const PlugInTrial&) = delete;
    PlugInTrial& operator=(const PlugInTrial&) = delete;

    /// All of them, in their order.
    CheckResults run();

    /// Complete; nothing when they are bad.
    const std::optional<Json>& settings() const { return settings_; }

    /// ptp4l's file; nothing when there is none. Its socket is in the same folder.
    std::optional<std::string> rendered() const;

private:
    Finding load();
    Finding readSchema();
    Finding complete();
    Finding initialise();
    Json harmlessSettings() const;

    const std::string library_;
    const UserSettings user_;
    std::string folder_;
    std::optional<PlugIn> plugIn_;
    std::optional<Schema> schema_;
    std::optional<Json> settings_;
};

} // namespace vantelhost
