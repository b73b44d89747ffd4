/// @file
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include <vantel_bc/zekeltr.h>

#include "HostStatus.h"

namespace vantelhost {

/// A loaded plug-in. The functions are those of zekeltr.h, with their rules.
class PlugIn {
public:
    /// Loads the library, with all its symbols resolved.
    /// @param library a path, or a name for the dynamic loader to find.
    /// Throws UsageError when it cannot be loaded, lacks a function or has another API version.
    explicit PlugIn(const std::string& library);

    std::uint32_t apiVersion() const { return apiVersion_; }
    std::string name() const;

    /// The schema of the parameters; empty when the status says why not.
    std::string schema(HostStatus& status) const;

    void initialise(void** slot, const std::string& config, HostStatus& status) const;
    void start(void** slot, HostStatus& status) const;
    void stop(void** slot) const;
    void finalise(void** slot) const;

private:
    struct Unload {
        void operator()(void* handle) const;
    };

    template <typename Function>
    Function* find(const char* name) const;

    std::string library_;
    std::unique_ptr<void, Unload> handle_;
    std::uint32_t apiVersion_;
    decltype(&zekeltr_getName) getName_;
    decltype(&zekeltr_getParameterValidationData) getParameterValidationData_;
    decltype(&zekeltr_initialize) initialize_;
    decltype(&zekeltr_start) start_;
    decltype(&zekeltr_stop) stop_;
    decltype(&zekeltr_finalize) finalize_;
};

} // namespace vantelhost
