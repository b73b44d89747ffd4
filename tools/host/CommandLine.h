/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>
#include <vector>

namespace vantelhost {

/// An epoch offset to write some time after the start.
struct TimedOffset {
    double seconds;
    std::int64_t nanoseconds;
};

struct RunOptions {
    std::string pluginPath = "libvantel_bc.so.19";
    std::string configFile; ///< "-" is the standard input; empty when there is none
    std::vector<std::string> assignments;
    std::vector<std::string> interfaces;
    bool noInterfaces = false;
    std::optional<double> seconds;
    bool jsonLines = false;
    bool useFifo = false;
    bool createFifo = false;
    std::string fifo = "/tmp/quillEpochOffset";
    std::optional<std::int64_t> epochOffset;
    std::vector<TimedOffset> timedOffsets; ///< in the order of their times
    bool refuseWhileStopping = false;
};

struct SchemaOptions {
    std::string pluginPath = "libvantel_bc.so.19";
    bool raw = false;
};

/// Reads the command line.
/// @return the options of the subcommand, or the exit status when the help or a complaint has been
///         printed instead.
std::variant<int, RunOptions, SchemaOptions> readCommandLine(int argc, const char* const* argv);

} // namespace vantelhost
