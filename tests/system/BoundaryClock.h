/// @file
#pragma once

#include <string>
#include <vector>

#include <sys/types.h>

#include "support/Child.h"
#include "system/ManagementClient.h"

/// linuxptp's ptp4l as a boundary clock on the interfaces that scripts/testbed.sh provides, and
/// what linuxptp's own client says about it.
class BoundaryClock {
public:
    /// Starts the daemon and waits until it follows the grandmaster. Throws when it does not.
    BoundaryClock();
    ~BoundaryClock();
    BoundaryClock(const BoundaryClock&) = delete;
    BoundaryClock& operator=(const BoundaryClock&) = delete;

    /// Whether this process runs in scripts/testbed.sh.
    static bool isProvided();

    std::size_t ports() const;
    std::string socket() const { return folder_ + "/boundary.uds"; }
    std::string path(const std::string& name) const { return folder_ + "/" + name; }

    /// One report per answer.
    std::vector<Report> ask(const std::string& dataSet) const;

private:
    /// Writes the configuration. @return what runs the daemon with it.
    std::vector<std::string> command() const;
    bool isFollowing() const;

    std::string folder_;
    Child daemon_;
};

/// No Syncs come while this object lives.
class PausedGrandmaster {
public:
    PausedGrandmaster();
    ~PausedGrandmaster();
    PausedGrandmaster(const PausedGrandmaster&) = delete;
    PausedGrandmaster& operator=(const PausedGrandmaster&) = delete;

private:
    pid_t pid_;
};
