/// @file
/// A host of the built library: it knows the installed headers and nothing else.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <vantel_bc/zekeltr.h>

#include "support/RecordingHost.h"
#include "support/SyslogCapture.h"
#include "support/TemporaryFolder.h"

/// The seven functions of the library, loaded at the first use.
struct Plugin {
    Plugin();

    decltype(&zekeltr_getAPIVersion) getAPIVersion;
    decltype(&zekeltr_initialize) initialize;
    decltype(&zekeltr_finalize) finalize;
    decltype(&zekeltr_start) start;
    decltype(&zekeltr_stop) stop;
    decltype(&zekeltr_getName) getName;
    decltype(&zekeltr_getParameterValidationData) getParameterValidationData;
};

/// A status with a resize operation of the host.
struct HostStatus : zeerr_Status {
    explicit HostStatus(std::int32_t initialCode = 0);
    HostStatus(std::int32_t initialCode, const std::string& text);
    ~HostStatus();
    HostStatus(const HostStatus&) = delete;
    HostStatus& operator=(const HostStatus&) = delete;

    std::string text() const { return json == nullptr ? "" : json; }
};

class PluginFixture : public testing::Test {
protected:
    static const Plugin& plugin();

    /// A configuration of the schema's defaults that writes "ptp4l_bc.conf", with one part of its
    /// text replaced.
    static std::string configuration(const std::string& part = "",
                                     const std::string& replacement = "");

    const TemporaryFolder folder;
    const SyslogCapture log;
    const RecordingHost host;
};
