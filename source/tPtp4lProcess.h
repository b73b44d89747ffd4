/// @file
#pragma once

#include <string>
#include <vector>

#include <sys/types.h>

namespace zekelVantel {

/// The ptp4l that a session runs as its child. Destroying this object does nothing to the child.
class tPtp4lProcess {
public:
    /// Runs `program -f configFile -i interface...` with an empty environment, no signal blocked,
    /// and SIGTERM and SIGCHLD at their defaults. A program that cannot be executed dies with
    /// status 255.
    /// @throws zeerr::Exception -52008 "zeoskerr_osFault" when there can be no child.
    void spawn(const std::string& program, const std::string& configFile,
               const std::vector<std::string>& interfaces);

    /// Whether there is no child, or no longer, or it was never one of this process.
    bool hasDied();

    /// Ends the child: SIGTERM, and SIGKILL after about 10 s. Does nothing without a child.
    void terminate();

private:
    pid_t pid_ = -1;
    bool reaped_ = false; ///< the number may be somebody else's by now
};

} // namespace zekelVantel
